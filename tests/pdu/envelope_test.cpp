#include <gtest/gtest.h>

#include <string>
#include <tuple>

#include "pdu/group_info_pdu.h"
#include "pdu/group_message_pdu.h"
#include "pdu/kvo_chat_xml_pdu.h"

namespace {

const char kGroupMessageBody[] =
    "<mtype>3</mtype><sendid>1</sendid><groupid>15</groupid><message><![CDATA[hi]]></message>";

}  // namespace

TEST(Envelope, PduTypeIsTheMainTypeFrom1To11AndElse0) {
    const CKvoChatXMLPDU pdu;
    for (int type = 0; type <= 12; ++type) {
        const std::string text =
            "<chat ver=\"1.0\"><mtype>" + std::to_string(type) + "</mtype></chat>";
        EXPECT_EQ(pdu.GetPDUType(text), type >= 1 && type <= 11 ? type : 0) << type;
    }
    const std::tuple<const char*, int> cases[] = {
        {"", 0},
        {"this is not xml", 0},
        {"<chats ver=\"1.0\"><mtype>3</mtype></chats>", 0},
        {"<x><chat ver=\"1.0\"><mtype>3</mtype></chat></x>", 0},
        {"<chat ver=\"1.0\"><mtype>3</mtype>", 0},
        {"<chat ver=\"1.0\"></chat>", 0},
        {"<chat ver=\"1.0\"><mtype></mtype></chat>", 0},
        {"<chat ver=\"1.0\"><mtype>-1</mtype></chat>", 0},
        {"<chat ver=\"2.0\"><mtype>3</mtype></chat>", 3},
        {"<chat><mtype>4</mtype></chat>", 4},
        {"<!-- note --><chat ver=\"1.0\"><mtype>5</mtype></chat>", 5},
    };
    for (const auto& [text, type] : cases)
        EXPECT_EQ(pdu.GetPDUType(text), type) << text;
}

TEST(Envelope, OnlyVersionOnePointZeroPassesTheCheck) {
    // Each ver attribute: what parsing answers and the version it leaves.
    const std::tuple<const char*, int, uint32_t> cases[] = {
        {" ver=\"1.0\"", 1, 1u},
        {" ver=\"1.00\"", 0, 1u},
        {" ver=\"2.0\"", 0, 2u},
        {" ver=\"\"", 0, 0u},
        {"", 0, 1u},  // no "ver": the version stays as it was
    };
    for (const auto& [attribute, result, version] : cases) {
        CGroupMessagePDU pdu;
        const std::string text =
            std::string("<chat") + attribute + ">" + kGroupMessageBody + "</chat>";
        EXPECT_EQ(pdu.ParseXMLPDU(text), result) << text;
        EXPECT_EQ(pdu.GetVersion(), version) << text;
    }
}

TEST(Envelope, AnEmptyMainTypeIsReadAsEmptyMatchesOnlyZeroAndIsWrittenEmpty) {
    CGroupInfoPDU pdu;
    TiXmlElement root("chat");
    root.SetAttribute("ver", "1.0");
    root.LinkEndChild(new TiXmlElement("mtype"));
    TiXmlElement* first = nullptr;
    EXPECT_FALSE(pdu.CheckVersionAndType(first, &root, XMLPDU_GROUP_INFO));
    EXPECT_EQ(pdu.GetMainType(), "");
    EXPECT_EQ(pdu.GetMainType_Int(), 0);
    EXPECT_EQ(first, root.FirstChildElement("mtype"));
    EXPECT_TRUE(pdu.CheckVersionAndType(first, &root, static_cast<XMLPDUType>(0)));
    ASSERT_EQ(pdu.GenerateXMLPDU(), 1);
    EXPECT_EQ(pdu.ToWireText(), "<chat ver=\"1.0\"><mtype /></chat>");
}

TEST(Envelope, ASecondGenerateOrParseReplacesTheFirst) {
    CGroupMessagePDU pdu;
    pdu.SetSendID(1u);
    pdu.GenerateXMLPDU();
    pdu.SetSendID(2u);
    pdu.GenerateXMLPDU();
    EXPECT_EQ(pdu.ToWireText(), "<chat ver=\"1.0\"><mtype>3</mtype><sendid>2</sendid></chat>");

    const std::string first = std::string("<chat ver=\"1.0\">") + kGroupMessageBody + "</chat>";
    std::string second = first;
    second.replace(second.find("hi"), 2, "again");
    ASSERT_EQ(pdu.ParseXMLPDU(first), 1);
    ASSERT_EQ(pdu.ParseXMLPDU(second), 1);
    EXPECT_EQ(pdu.GetMessageContent(), "again");
    // The document holds the second text only.
    EXPECT_EQ(pdu.ToWireText(), second);
}
