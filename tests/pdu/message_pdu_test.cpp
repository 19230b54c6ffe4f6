#include <gtest/gtest.h>

#include <string>

#include "pdu/group_message_pdu.h"
#include "pdu/private_message_pdu.h"

namespace {

// Free text that needs CDATA: markup, entities, quotes, line ends, blanks and UTF-8.
const char kAwkwardText[] = "  <b>x</b> &amp; \"q\" 'a'\r\nZo\xC3\xAB  ";

void FillPrivateMessage(CPrivateMessagePDU& pdu) {
    pdu.SetSendID(7u);
    pdu.SetSenderName("Ann");
    pdu.SetReveID(static_cast<uint32_t>(-1));
    pdu.SetReceiverName("Host");
    pdu.SetMessageContent("hi");
}

}  // namespace

TEST(PrivateMessage, PrintsItsElementsInWireOrder) {
    CPrivateMessagePDU pdu;
    FillPrivateMessage(pdu);
    ASSERT_EQ(pdu.GenerateXMLPDU(), 1);
    EXPECT_EQ(pdu.ToWireText(),
              "<chat ver=\"1.0\"><mtype>2</mtype><sendid>7</sendid>"
              "<SenderName><![CDATA[Ann]]></SenderName><recid>4294967295</recid>"
              "<ReceiverName><![CDATA[Host]]></ReceiverName><message><![CDATA[hi]]></message>"
              "</chat>");
}

TEST(PrivateMessage, EmptyFieldsAreLeftOutAndAnEmptyMessageCannotBeRead) {
    CPrivateMessagePDU pdu;
    pdu.SetSendID(7u);
    pdu.SetReveID(0u);
    pdu.SetMessageContent("x");
    pdu.GenerateXMLPDU();
    EXPECT_EQ(pdu.ToWireText(),
              "<chat ver=\"1.0\"><mtype>2</mtype><sendid>7</sendid><recid>0</recid>"
              "<message><![CDATA[x]]></message></chat>");

    pdu.SetMessageContent("");
    pdu.GenerateXMLPDU();
    const std::string text = pdu.ToWireText();
    EXPECT_EQ(text.find("<message"), std::string::npos);
    CPrivateMessagePDU back;
    EXPECT_EQ(back.ParseXMLPDU(text), 0);
}

TEST(PrivateMessage, RoundTripKeepsEveryField) {
    CPrivateMessagePDU pdu;
    FillPrivateMessage(pdu);
    pdu.SetSenderName(kAwkwardText);
    pdu.SetMessageContent(kAwkwardText);
    pdu.GenerateXMLPDU();
    CPrivateMessagePDU back;
    ASSERT_EQ(back.ParseXMLPDU(pdu.ToWireText()), 1);
    EXPECT_EQ(back.GetSendID(), "7");
    EXPECT_EQ(back.GetSenderName(), kAwkwardText);
    EXPECT_EQ(back.GetReveID(), "4294967295");
    EXPECT_EQ(back.GetReceiverName(), "Host");
    EXPECT_EQ(back.GetMessageContent(), kAwkwardText);
    back.GenerateXMLPDU();
    EXPECT_EQ(back.ToWireText(), pdu.ToWireText());
}

TEST(PrivateMessage, ReceiveIdsKeepTheirMeaningBothWays) {
    // 0 all participants, -1 host, -2 host and presenter, -3 presenter, -4 panelists,
    // -5 host, presenter and panelists, -6 attendees, or a user id.
    for (const int id : {0, -1, -2, -3, -4, -5, -6, 1001}) {
        CPrivateMessagePDU pdu;
        FillPrivateMessage(pdu);
        pdu.SetReveID(static_cast<uint32_t>(id));
        pdu.GenerateXMLPDU();
        CPrivateMessagePDU back;
        ASSERT_EQ(back.ParseXMLPDU(pdu.ToWireText()), 1) << id;
        EXPECT_EQ(back.GetReveID(), std::to_string(static_cast<uint32_t>(id)));
        EXPECT_EQ(back.GetReveID_DWORD(), static_cast<uint32_t>(id)) << id;

        // The signed form some senders write reads the same.
        CPrivateMessagePDU signedForm;
        ASSERT_EQ(signedForm.ParseXMLPDU("<chat ver=\"1.0\"><mtype>2</mtype><sendid>1</sendid>"
                                         "<recid>" +
                                         std::to_string(id) + "</recid><message/></chat>"),
                  1);
        EXPECT_EQ(signedForm.GetReveID_DWORD(), static_cast<uint32_t>(id)) << id;
    }
}

TEST(PrivateMessage, RequiredElementsAndWhatAFailureLeavesBehind) {
    const struct {
        const char* body;
        int result;
    } cases[] = {
        {"<sendid>7</sendid><recid>1</recid><message/>", 1},
        {"<recid>1</recid><message/>", 0},
        {"<sendid></sendid><recid>1</recid><message/>", 0},
        {"<sendid>7</sendid><message/>", 0},
        {"<sendid>7</sendid><recid>1</recid>", 0},
        {"<message/><recid>1</recid><sendid>7</sendid>", 1},
    };
    for (const auto& c : cases) {
        CPrivateMessagePDU pdu;
        const std::string text =
            std::string("<chat ver=\"1.0\"><mtype>2</mtype>") + c.body + "</chat>";
        EXPECT_EQ(pdu.ParseXMLPDU(text), c.result) << c.body;
    }
    CPrivateMessagePDU partial;
    EXPECT_EQ(partial.ParseXMLPDU("<chat ver=\"1.0\"><mtype>2</mtype><sendid>7</sendid>"
                                  "<SenderName><![CDATA[Ann]]></SenderName></chat>"),
              0);
    EXPECT_EQ(partial.GetSendID(), "7");
    EXPECT_EQ(partial.GetSenderName(), "Ann");
    EXPECT_EQ(partial.ParseXMLPDU("<chat ver=\"1.0\"><mtype>3</mtype><sendid>7</sendid>"
                                  "<recid>1</recid><message/></chat>"),
              0);
}

TEST(PrivateMessage, CdataEndMarkersGetTheirBlankWhenSet) {
    CPrivateMessagePDU pdu;
    FillPrivateMessage(pdu);
    pdu.SetMessageContent("]]>a]]>b]]>]]>");
    EXPECT_EQ(pdu.GetMessageContent(), "]] >a]] >b]] >]] >");
    pdu.GenerateXMLPDU();
    const std::string text = pdu.ToWireText();
    EXPECT_NE(text.find("<message><![CDATA[]] >a]] >b]] >]] >]]></message>"), std::string::npos);
    CPrivateMessagePDU back;
    ASSERT_EQ(back.ParseXMLPDU(text), 1);
    EXPECT_EQ(back.GetMessageContent(), "]] >a]] >b]] >]] >");
}

TEST(GroupMessage, PrintsItsElementsInWireOrder) {
    CGroupMessagePDU pdu;
    pdu.SetSenderName("Ann");
    pdu.SetSendNodeId(4096u);
    pdu.SetReceiverName("All Participants");
    pdu.SetSendID(7u);
    pdu.SetGroupID(15u);
    pdu.SetMessageContent("a]]>b");
    pdu.SetGroupCacheId(4097u);
    ASSERT_EQ(pdu.GenerateXMLPDU(), 1);
    EXPECT_EQ(pdu.ToWireText(),
              "<chat ver=\"1.0\"><mtype>3</mtype><sendid>7</sendid><sendnodeid>4096</sendnodeid>"
              "<SenderName><![CDATA[Ann]]></SenderName><groupid>15</groupid>"
              "<ReceiverName><![CDATA[All Participants]]></ReceiverName>"
              "<GroupCacheId>4097</GroupCacheId><message><![CDATA[a]] >b]]></message></chat>");
    // The text itself keeps the marker; only the document carries the blank.
    EXPECT_EQ(pdu.GetMessageContent(), "a]]>b");
}

TEST(GroupMessage, RoundTripKeepsEveryFieldButTheCacheHandleValue) {
    CGroupMessagePDU pdu;
    pdu.SetSenderName(kAwkwardText);
    pdu.SetSendNodeId(4096u);
    pdu.SetReceiverName("Panelists");
    pdu.SetSendID(0xFFFFFFFEu);
    pdu.SetGroupID(4u);
    pdu.SetMessageContent(kAwkwardText);
    pdu.SetGroupCacheId(4097u);
    EXPECT_EQ(pdu.GetGroupCacheId(), "4097");
    EXPECT_EQ(pdu.GetGroupCacheIdValue(), 4097u);
    pdu.GenerateXMLPDU();

    CGroupMessagePDU back;
    ASSERT_EQ(back.ParseXMLPDU(pdu.ToWireText()), 1);
    EXPECT_EQ(back.GetSenderName(), kAwkwardText);
    EXPECT_EQ(back.GetSendNodeId_DWORD(), 4096u);
    EXPECT_EQ(back.GetReceiverName(), "Panelists");
    EXPECT_EQ(back.GetSendID_DWORD(), 0xFFFFFFFEu);
    EXPECT_EQ(back.GetGroupID_DWORD(), 4u);
    EXPECT_EQ(back.GetMessageContent(), kAwkwardText);
    EXPECT_EQ(back.GetGroupCacheId(), "4097");
    EXPECT_EQ(back.GetGroupCacheId_DWORD(), 4097u);
    EXPECT_EQ(back.GetGroupCacheIdValue(), 0u);
    back.GenerateXMLPDU();
    EXPECT_EQ(back.ToWireText(), pdu.ToWireText());
}

TEST(GroupMessage, RequiredAndOptionalElements) {
    const struct {
        const char* body;
        int result;
    } cases[] = {
        {"<sendid>7</sendid><groupid>15</groupid><message/>", 1},
        {"<groupid>15</groupid><message/>", 0},
        {"<sendid>7</sendid><message/>", 0},
        {"<sendid>7</sendid><groupid>15</groupid>", 0},
        {"<sendid>7</sendid><groupid></groupid><message/>", 0},
    };
    for (const auto& c : cases) {
        CGroupMessagePDU pdu;
        const std::string text =
            std::string("<chat ver=\"1.0\"><mtype>3</mtype>") + c.body + "</chat>";
        EXPECT_EQ(pdu.ParseXMLPDU(text), c.result) << c.body;
    }
    CGroupMessagePDU minimal;
    ASSERT_EQ(minimal.ParseXMLPDU("<chat ver=\"1.0\"><mtype>3</mtype><sendid>7</sendid>"
                                  "<groupid>15</groupid><message/></chat>"),
              1);
    EXPECT_EQ(minimal.GetSenderName(), "");
    EXPECT_EQ(minimal.GetMessageContent(), "");
    EXPECT_EQ(minimal.GetGroupCacheId_DWORD(), 0u);
    EXPECT_EQ(minimal.GetGroupID_DWORD(), 15u);

    CGroupMessagePDU bare;
    bare.SetSendID(7u);
    bare.SetGroupID(15u);
    bare.SetMessageContent("m");
    bare.GenerateXMLPDU();
    EXPECT_EQ(bare.ToWireText(),
              "<chat ver=\"1.0\"><mtype>3</mtype><sendid>7</sendid><groupid>15</groupid>"
              "<message><![CDATA[m]]></message></chat>");
}

TEST(GroupMessage, TheFirstElementOfANameAndTheFirstCdataSectionCount) {
    CGroupMessagePDU pdu;
    ASSERT_EQ(pdu.ParseXMLPDU("<chat ver=\"1.0\"><mtype>3</mtype><message><![CDATA[one]]>"
                              "<![CDATA[two]]></message><groupid>15</groupid><sendid>7</sendid>"
                              "<sendid>8</sendid><groupid>16</groupid></chat>"),
              1);
    EXPECT_EQ(pdu.GetMessageContent(), "one");
    EXPECT_EQ(pdu.GetSendID(), "7");
    EXPECT_EQ(pdu.GetGroupID(), "15");
}
