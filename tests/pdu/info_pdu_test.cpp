#include <gtest/gtest.h>

#include <string>

#include "pdu/chat_user_info_pdu.h"
#include "pdu/group_info_pdu.h"
#include "pdu/roster_info_pdu.h"

namespace {

void FillRoster(CRosterInfoPDU& pdu) {
    pdu.SetNodeID(4096u);
    pdu.SetUserName("Ann <Host>");
    pdu.SetRoleSet(3u);
    pdu.SetVisible(1);
    pdu.SetUserType(1u);
}

}  // namespace

TEST(RosterInfo, PrintsItsElementsInWireOrderWithThePhoneAsPlainText) {
    CRosterInfoPDU pdu;
    FillRoster(pdu);
    pdu.SetFirstName("Ann");
    pdu.SetLastName("Lee");
    pdu.SetPhoneNumber("+1 <555> & \"7\"");
    pdu.SetEmailAddress("ann@example.org");
    pdu.SetCustomerId(0u);
    pdu.SetUserExternalTag(2u);
    ASSERT_EQ(pdu.GenerateXMLPDU(), 1);
    EXPECT_EQ(pdu.ToWireText(),
              "<chat ver=\"1.0\"><mtype>5</mtype><NodeID>4096</NodeID>"
              "<UserName><![CDATA[Ann <Host>]]></UserName><RoleSet>3</RoleSet>"
              "<Visible>1</Visible><UserType>1</UserType><FName><![CDATA[Ann]]></FName>"
              "<LName><![CDATA[Lee]]></LName><Phone>+1 &lt;555&gt; &amp; &quot;7&quot;</Phone>"
              "<Email><![CDATA[ann@example.org]]></Email><GuestID>0</GuestID><UIT>2</UIT></chat>");

    CRosterInfoPDU back;
    ASSERT_EQ(back.ParseXMLPDU(pdu.ToWireText()), 1);
    EXPECT_EQ(back.GetNodeID_DWORD(), 4096u);
    EXPECT_EQ(back.GetUserNameW(), "Ann <Host>");
    EXPECT_EQ(back.GetRoleSet_DWORD(), 3u);
    EXPECT_EQ(back.GetVisible_BOOL(), 1);
    EXPECT_EQ(back.GetUserType_DWORD(), 1u);
    EXPECT_EQ(back.GetFirstName(), "Ann");
    EXPECT_EQ(back.GetLastName(), "Lee");
    EXPECT_EQ(back.GetPhoneNumber(), "+1 <555> & \"7\"");
    EXPECT_EQ(back.GetEmailAddress(), "ann@example.org");
    EXPECT_EQ(back.GetCustomerId(), "0");
    EXPECT_EQ(back.GetUserExternalTag_DWORD(), 2u);
    back.GenerateXMLPDU();
    EXPECT_EQ(back.ToWireText(), pdu.ToWireText());
}

TEST(RosterInfo, ATagOfZeroAndMissingDetailsAreLeftOut) {
    CRosterInfoPDU pdu;
    FillRoster(pdu);
    pdu.SetUserExternalTag(0u);
    pdu.GenerateXMLPDU();
    EXPECT_EQ(pdu.ToWireText(),
              "<chat ver=\"1.0\"><mtype>5</mtype><NodeID>4096</NodeID>"
              "<UserName><![CDATA[Ann <Host>]]></UserName><RoleSet>3</RoleSet>"
              "<Visible>1</Visible><UserType>1</UserType></chat>");
}

TEST(RosterInfo, EveryElementIsOptional) {
    CRosterInfoPDU pdu;
    ASSERT_EQ(pdu.ParseXMLPDU("<chat ver=\"1.0\"><mtype>5</mtype></chat>"), 1);
    EXPECT_EQ(pdu.GetNodeID(), "");
    EXPECT_EQ(pdu.GetUserNameW(), "");
    EXPECT_EQ(pdu.GetVisible_BOOL(), 0);
    EXPECT_EQ(pdu.GetCustomerId_DWORD(), 0u);
    EXPECT_EQ(pdu.ParseXMLPDU("<chat ver=\"1.0\"><mtype>4</mtype></chat>"), 0);
}

TEST(UserInfo, PrintsAndReadsBack) {
    CChatUserInfoPDU pdu;
    pdu.SetUserID(1001u);
    pdu.SetUserName("Bo]]>b");
    pdu.SetUserExternalTag(0u);
    ASSERT_EQ(pdu.GenerateXMLPDU(), 1);
    EXPECT_EQ(pdu.ToWireText(),
              "<chat ver=\"1.0\"><mtype>4</mtype><uid>1001</uid><un><![CDATA[Bo]] >b]]></un>"
              "</chat>");
    pdu.SetUserExternalTag(9u);
    pdu.GenerateXMLPDU();
    CChatUserInfoPDU back;
    ASSERT_EQ(back.ParseXMLPDU(pdu.ToWireText()), 1);
    EXPECT_EQ(back.GetUserID_DWORD(), 1001u);
    EXPECT_EQ(back.GetUserName(), "Bo]] >b");
    EXPECT_EQ(back.GetUserExternalTag_DWORD(), 9u);
}

TEST(UserInfo, TheNameElementIsRequiredButMayBeEmpty) {
    const struct {
        const char* body;
        int result;
    } cases[] = {
        {"<uid>5</uid><un><![CDATA[Al]]></un>", 1},
        {"<uid>5</uid><un/>", 1},
        {"<uid>5</uid>", 0},
        {"<un><![CDATA[Al]]></un>", 0},
    };
    for (const auto& c : cases) {
        CChatUserInfoPDU pdu;
        EXPECT_EQ(
            pdu.ParseXMLPDU(std::string("<chat ver=\"1.0\"><mtype>4</mtype>") + c.body + "</chat>"),
            c.result)
            << c.body;
    }
    CChatUserInfoPDU unnamed;
    unnamed.SetUserID(5u);
    unnamed.GenerateXMLPDU();
    EXPECT_EQ(unnamed.ToWireText(), "<chat ver=\"1.0\"><mtype>4</mtype><uid>5</uid></chat>");
}

TEST(GroupInfo, PrintsAndReadsBack) {
    CGroupInfoPDU pdu;
    pdu.SetGroupName("Host & Presenter");
    pdu.SetGroupHandle(4097u);
    ASSERT_EQ(pdu.GenerateXMLPDU(), 1);
    EXPECT_EQ(pdu.ToWireText(),
              "<chat ver=\"1.0\"><mtype>1</mtype><grouphandle>4097</grouphandle>"
              "<groupname><![CDATA[Host & Presenter]]></groupname></chat>");
    CGroupInfoPDU back;
    ASSERT_EQ(back.ParseXMLPDU(pdu.ToWireText()), 1);
    EXPECT_EQ(back.GetGroupHandle_DWORD(), 4097u);
    EXPECT_EQ(back.GetGroupName(), "Host & Presenter");
}

TEST(GroupInfo, HandleAndNameAreRequired) {
    const struct {
        const char* body;
        int result;
    } cases[] = {
        {"<grouphandle>1</grouphandle><groupname/>", 1},
        {"<groupname><![CDATA[x]]></groupname>", 0},
        {"<grouphandle>1</grouphandle>", 0},
    };
    for (const auto& c : cases) {
        CGroupInfoPDU pdu;
        EXPECT_EQ(
            pdu.ParseXMLPDU(std::string("<chat ver=\"1.0\"><mtype>1</mtype>") + c.body + "</chat>"),
            c.result)
            << c.body;
    }
}
