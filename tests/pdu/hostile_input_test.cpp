#include <gtest/gtest.h>

#include <string>
#include <tuple>

#include "pdu/chat_user_info_pdu.h"
#include "pdu/faq_macro_info_pdu.h"
#include "pdu/group_message_pdu.h"
#include "pdu/xml_limits.h"

namespace {

const char kHead[] = "<chat ver=\"1.0\"><mtype>3</mtype><sendid>1</sendid><groupid>15</groupid>";

std::string GroupMessageWith(const std::string& message) {
    return std::string(kHead) + "<message>" + message + "</message></chat>";
}

std::string Repeat(const std::string& piece, size_t count) {
    std::string out;
    for (size_t i = 0; i < count; ++i)
        out += piece;
    return out;
}

// Far deeper than tinyxml's recursion survives on an 8 MiB stack (about 40000 levels).
const std::string kCrashDeep = Repeat("<a>", 100000);

}  // namespace

// Received bytes are read up to their length only: what follows in memory is never looked at.
TEST(HostileInput, EveryCutOfAPduFailsAndOnlyTheWholeOneParsesUpToItsLengthOrANul) {
    CGroupMessagePDU sent;
    sent.SetSenderName("Ann");
    sent.SetSendID(7u);
    sent.SetGroupID(15u);
    sent.SetMessageContent("hello");
    sent.GenerateXMLPDU();
    const std::string text = sent.ToWireText();
    const std::string memory = text + "<broken";
    for (size_t length = 0; length < text.size(); ++length) {
        CGroupMessagePDU pdu;
        EXPECT_EQ(pdu.ParseXMLPDU(memory.data(), length), 0) << text.substr(0, length);
    }
    CGroupMessagePDU whole;
    EXPECT_EQ(whole.ParseXMLPDU(memory.data(), text.size()), 1);
    EXPECT_EQ(whole.GetPDUType(memory.data(), text.size()), 3);
    EXPECT_EQ(whole.ParseXMLPDU(memory.data(), memory.size()), 0);
    EXPECT_EQ(whole.ParseXMLPDU(nullptr, 5), 0);
    // A NUL ends the text as the parser sees it.
    EXPECT_EQ(whole.ParseXMLPDU(text + std::string("\0<x", 3)), 1);
    const std::string cut = GroupMessageWith(std::string("<![CDATA[h") + '\0' + "i]]>");
    EXPECT_EQ(whole.ParseXMLPDU(cut.data(), cut.size()), 0);
}

// More disguises (a character reference over a CDATA section or a comment, a quoted '>' in a
// declaration, a cut sequence after a byte-order mark) are in the fuzz corpus, whose replay
// checks the depth of the tree the parser builds.
TEST(HostileInput, NestingIsReadUpToTheDepthCapOnlyHoweverItIsDisguised) {
    // "chat" and "message" are two levels; the nested elements sit inside the message.
    const size_t inner = kMaxXmlDepth - 2;
    CGroupMessagePDU capped;
    EXPECT_EQ(capped.ParseXMLPDU(GroupMessageWith(Repeat("<a>", inner) + Repeat("</a>", inner))),
              1);
    EXPECT_EQ(
        capped.ParseXMLPDU(GroupMessageWith(Repeat("<a>", inner + 1) + Repeat("</a>", inner + 1))),
        0);
    // Siblings are not nesting.
    EXPECT_EQ(capped.ParseXMLPDU(GroupMessageWith(Repeat("<a><b/></a>", 200))), 1);
    const std::string cases[] = {
        kCrashDeep,
        std::string(kHead) + kCrashDeep,
        // Markup-looking text inside attribute values.
        "<chat ver=\"<![CDATA[\" x='<!--'>" + kCrashDeep,
        // A byte-order mark makes the text UTF-8.
        "\xEF\xBB\xBF<chat a=\"\xC3\xA9\">" + kCrashDeep,
        // Unknown markup and stray end tags around the nesting.
        "<!DOCTYPE chat [<!ENTITY x \"y\">]><chat></nothing>" + kCrashDeep,
    };
    for (const std::string& text : cases) {
        CGroupMessagePDU pdu;
        EXPECT_EQ(pdu.GetPDUType(text), 0) << text.substr(0, 60);
        EXPECT_EQ(pdu.ParseXMLPDU(text), 0) << text.substr(0, 60);
    }
}

TEST(HostileInput, AttributeAndNodeCountsAreCapped) {
    std::string attributes;
    for (size_t i = 1; i < kMaxXmlAttributes; ++i)
        attributes += " a" + std::to_string(i) + "=\"1\"";
    const std::string body =
        std::string(kHead).substr(std::string("<chat ver=\"1.0\">").size()) + "<message/></chat>";
    CGroupMessagePDU pdu;
    EXPECT_EQ(pdu.ParseXMLPDU("<chat ver=\"1.0\"" + attributes + ">" + body), 1);
    EXPECT_EQ(pdu.ParseXMLPDU("<chat ver=\"1.0\"" + attributes + " z=\"1\">" + body), 0);
    EXPECT_EQ(pdu.ParseXMLPDU(GroupMessageWith(Repeat("<x/>", kMaxXmlNodes))), 0);
}

TEST(HostileInput, AMegabyteMessageParsesAndAnOversizedTextIsRefused) {
    const std::string line(1024 * 1024, 'x');
    CGroupMessagePDU sent;
    sent.SetSendID(7u);
    sent.SetGroupID(15u);
    sent.SetMessageContent(line);
    sent.GenerateXMLPDU();
    CGroupMessagePDU pdu;
    ASSERT_EQ(pdu.ParseXMLPDU(sent.ToWireText()), 1);
    EXPECT_EQ(pdu.GetMessageContent(), line);

    // A megabyte of end markers grows by a third on the way and still fits.
    sent.SetMessageContent(Repeat("]]>", 1024 * 1024 / 3));
    sent.GenerateXMLPDU();
    ASSERT_EQ(pdu.ParseXMLPDU(sent.ToWireText()), 1);
    EXPECT_EQ(pdu.GetMessageContent(), Repeat("]] >", 1024 * 1024 / 3));

    const std::string huge = GroupMessageWith("<![CDATA[" + std::string(kMaxXmlBytes, 'x') + "]]>");
    EXPECT_EQ(pdu.ParseXMLPDU(huge.data(), huge.size()), 0);
    EXPECT_EQ(pdu.GetPDUType(huge), 0);
}

TEST(HostileInput, BytesThatAreNotUtf8AreKeptAsTheyCame) {
    const std::string odd = "\xFF\xFE\xC3 \xF0";
    CGroupMessagePDU sent;
    sent.SetSendID(7u);
    sent.SetGroupID(15u);
    sent.SetSenderName(odd);
    sent.SetMessageContent(odd);
    sent.GenerateXMLPDU();
    CGroupMessagePDU pdu;
    ASSERT_EQ(pdu.ParseXMLPDU(sent.ToWireText()), 1);
    EXPECT_EQ(pdu.GetSenderName(), odd);
    EXPECT_EQ(pdu.GetMessageContent(), odd);

    // Marked as UTF-8 but with a cut sequence in plain text: read byte by byte instead of
    // letting the parser step over the end tag.
    CChatUserInfoPDU info;
    ASSERT_EQ(info.ParseXMLPDU("\xEF\xBB\xBF<chat ver=\"1.0\"><mtype>4</mtype><uid>7\xF0</uid>"
                               "<un/></chat>"),
              1);
    EXPECT_EQ(info.GetUserID(), "7\xF0");
}

TEST(HostileInput, CharacterReferencesFollowTheDeclaredEncoding) {
    // Each prefix and the first name it makes of "Ren&#233;".
    const std::tuple<const char*, const char*> cases[] = {
        {"", "Ren\xE9"},
        {"\xEF\xBB\xBF", "Ren\xC3\xA9"},
        {"<?xml version=\"1.0\" encoding=\"UTF-8\"?>", "Ren\xC3\xA9"},
        {"<?xml version=\"1.0\"?>", "Ren\xC3\xA9"},
        {"<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?>", "Ren\xE9"},
    };
    for (const auto& [prefix, name] : cases) {
        CFAQMacroInfoPDU pdu;
        ASSERT_EQ(pdu.ParseXMLPDU(std::string(prefix) +
                                  "<chat ver=\"1.0\"><mtype>8</mtype><fname>Ren&#233;</fname>"
                                  "<lname>&#0;&#xFFFFFFFFFFFF;&unknown;</lname></chat>"),
                  1)
            << prefix;
        EXPECT_EQ(pdu.GetFirstName(), name) << prefix;
    }
}
