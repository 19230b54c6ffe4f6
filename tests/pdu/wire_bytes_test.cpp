// The printed bytes are what peers parse: pinned literally, then read back and printed again.
#include <gtest/gtest.h>

#include <string>

#include "pdu/chat_user_info_pdu.h"
#include "pdu/group_info_pdu.h"
#include "pdu/group_message_pdu.h"
#include "pdu/private_message_pdu.h"
#include "pdu/roster_info_pdu.h"

namespace {

// Free text that needs CDATA: markup, entities, quotes, line ends, blanks and UTF-8.
const char kAwkward[] = "  <b>x</b> &amp; \"q\" 'a'\r\nZo\xC3\xAB  ";

// Reads sent's bytes into a fresh PDU, checks that printing it again gives the same bytes
// (so every text came back into its own field whole), and leaves it in back for the numbers
// no engine code reads (those the engine reads are checked where it acts on them).
template <typename Pdu>
void ReadBack(const Pdu& sent, Pdu& back) {
    ASSERT_EQ(back.ParseXMLPDU(sent.ToWireText()), 1) << sent.ToWireText();
    ASSERT_EQ(back.GenerateXMLPDU(), 1);
    EXPECT_EQ(back.ToWireText(), sent.ToWireText());
}

}  // namespace

TEST(WireBytes, PrivateMessage) {
    CPrivateMessagePDU pdu;
    pdu.SetSendID(7u);
    pdu.SetSenderName("Ann");
    pdu.SetReveID(static_cast<uint32_t>(-1));
    pdu.SetReceiverName("Host");
    pdu.SetMessageContent("hi");
    ASSERT_EQ(pdu.GenerateXMLPDU(), 1);
    EXPECT_EQ(pdu.ToWireText(),
              "<chat ver=\"1.0\"><mtype>2</mtype><sendid>7</sendid>"
              "<SenderName><![CDATA[Ann]]></SenderName><recid>4294967295</recid>"
              "<ReceiverName><![CDATA[Host]]></ReceiverName><message><![CDATA[hi]]></message>"
              "</chat>");

    pdu.SetSenderName(kAwkward);
    pdu.SetMessageContent(kAwkward);
    pdu.GenerateXMLPDU();
    CPrivateMessagePDU back;
    ReadBack(pdu, back);

    CPrivateMessagePDU bare;
    bare.SetSendID(7u);
    bare.SetReveID(0u);
    bare.GenerateXMLPDU();
    EXPECT_EQ(bare.ToWireText(),
              "<chat ver=\"1.0\"><mtype>2</mtype><sendid>7</sendid><recid>0</recid></chat>");
}

TEST(WireBytes, GroupMessage) {
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

    pdu.SetSenderName(kAwkward);
    pdu.SetMessageContent(kAwkward);
    pdu.GenerateXMLPDU();
    CGroupMessagePDU back;
    ReadBack(pdu, back);
    EXPECT_EQ(back.GetSendNodeId_DWORD(), 4096u);

    CGroupMessagePDU bare;
    bare.SetSendID(7u);
    bare.SetGroupID(15u);
    bare.SetMessageContent("m");
    bare.GenerateXMLPDU();
    EXPECT_EQ(bare.ToWireText(),
              "<chat ver=\"1.0\"><mtype>3</mtype><sendid>7</sendid><groupid>15</groupid>"
              "<message><![CDATA[m]]></message></chat>");
}

TEST(WireBytes, RosterInfoWithThePhoneAsPlainText) {
    CRosterInfoPDU pdu;
    pdu.SetNodeID(4096u);
    pdu.SetUserName("Ann <Host>");
    pdu.SetRoleSet(3u);
    pdu.SetVisible(1);
    pdu.SetUserType(1u);
    ASSERT_EQ(pdu.GenerateXMLPDU(), 1);
    // No FAQ details and a tag of 0: none of their elements.
    EXPECT_EQ(pdu.ToWireText(),
              "<chat ver=\"1.0\"><mtype>5</mtype><NodeID>4096</NodeID>"
              "<UserName><![CDATA[Ann <Host>]]></UserName><RoleSet>3</RoleSet>"
              "<Visible>1</Visible><UserType>1</UserType></chat>");

    pdu.SetFirstName("Ann");
    pdu.SetLastName("Lee");
    pdu.SetPhoneNumber("+1 <555> & \"7\"");
    pdu.SetEmailAddress("ann@example.org");
    pdu.SetCustomerId(0u);
    pdu.SetUserExternalTag(2u);
    pdu.GenerateXMLPDU();
    EXPECT_EQ(pdu.ToWireText(),
              "<chat ver=\"1.0\"><mtype>5</mtype><NodeID>4096</NodeID>"
              "<UserName><![CDATA[Ann <Host>]]></UserName><RoleSet>3</RoleSet>"
              "<Visible>1</Visible><UserType>1</UserType><FName><![CDATA[Ann]]></FName>"
              "<LName><![CDATA[Lee]]></LName><Phone>+1 &lt;555&gt; &amp; &quot;7&quot;</Phone>"
              "<Email><![CDATA[ann@example.org]]></Email><GuestID>0</GuestID><UIT>2</UIT></chat>");
    CRosterInfoPDU back;
    ReadBack(pdu, back);
    EXPECT_EQ(back.GetNodeID_DWORD(), 4096u);
}

TEST(WireBytes, UserInfoAndGroupInfo) {
    CChatUserInfoPDU user;
    user.SetUserID(1001u);
    user.SetUserName("Bo]]>b");
    ASSERT_EQ(user.GenerateXMLPDU(), 1);
    EXPECT_EQ(user.ToWireText(),
              "<chat ver=\"1.0\"><mtype>4</mtype><uid>1001</uid><un><![CDATA[Bo]] >b]]></un>"
              "</chat>");
    user.SetUserExternalTag(9u);
    user.GenerateXMLPDU();
    CChatUserInfoPDU userBack;
    ReadBack(user, userBack);
    EXPECT_EQ(userBack.GetUserName(), "Bo]] >b");

    CGroupInfoPDU group;
    group.SetGroupName("Host & Presenter");
    group.SetGroupHandle(4097u);
    ASSERT_EQ(group.GenerateXMLPDU(), 1);
    EXPECT_EQ(group.ToWireText(),
              "<chat ver=\"1.0\"><mtype>1</mtype><grouphandle>4097</grouphandle>"
              "<groupname><![CDATA[Host & Presenter]]></groupname></chat>");
    CGroupInfoPDU groupBack;
    ReadBack(group, groupBack);
    EXPECT_EQ(groupBack.GetGroupHandle_DWORD(), 4097u);
}
