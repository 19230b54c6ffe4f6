// What each PDU requires of a received text, and what reading leaves in its fields.
#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <tuple>

#include "pdu/chat_user_info_pdu.h"
#include "pdu/customer_id_pdu.h"
#include "pdu/faq_macro_info_pdu.h"
#include "pdu/group_info_pdu.h"
#include "pdu/group_message_pdu.h"
#include "pdu/prim_cust_node_id_pdu.h"
#include "pdu/private_message_pdu.h"
#include "pdu/roster_info_pdu.h"

namespace {

std::string Chat(int type, const std::string& body) {
    return "<chat ver=\"1.0\"><mtype>" + std::to_string(type) + "</mtype>" + body + "</chat>";
}

template <typename Pdu>
int Parse(const std::string& text) {
    Pdu pdu;
    return pdu.ParseXMLPDU(text);
}

}  // namespace

TEST(Reading, RequiredAndOptionalElementsOfEachKind) {
    // Each parser, the main type and body of the text it is given, and its answer.
    const std::tuple<std::function<int(const std::string&)>, int, const char*, int> cases[] = {
        {Parse<CPrivateMessagePDU>, 2, "<sendid>7</sendid><recid>1</recid><message/>", 1},
        {Parse<CPrivateMessagePDU>, 2, "<message/><recid>1</recid><sendid>7</sendid>", 1},
        {Parse<CPrivateMessagePDU>, 2, "<recid>1</recid><message/>", 0},
        {Parse<CPrivateMessagePDU>, 2, "<sendid></sendid><recid>1</recid><message/>", 0},
        {Parse<CPrivateMessagePDU>, 2, "<sendid>7</sendid><message/>", 0},
        {Parse<CPrivateMessagePDU>, 2, "<sendid>7</sendid><recid>1</recid>", 0},
        {Parse<CPrivateMessagePDU>, 3, "<sendid>7</sendid><recid>1</recid><message/>", 0},
        {Parse<CGroupMessagePDU>, 3, "<sendid>7</sendid><groupid>15</groupid><message/>", 1},
        {Parse<CGroupMessagePDU>, 3, "<groupid>15</groupid><message/>", 0},
        {Parse<CGroupMessagePDU>, 3, "<sendid>7</sendid><groupid/><message/>", 0},
        {Parse<CGroupMessagePDU>, 3, "<sendid>7</sendid><groupid>15</groupid>", 0},
        {Parse<CChatUserInfoPDU>, 4, "<uid>5</uid><un/>", 1},
        {Parse<CChatUserInfoPDU>, 4, "<uid>5</uid>", 0},
        {Parse<CChatUserInfoPDU>, 4, "<un>Al</un>", 0},
        {Parse<CGroupInfoPDU>, 1, "<grouphandle>1</grouphandle><groupname/>", 1},
        {Parse<CGroupInfoPDU>, 1, "<groupname>x</groupname>", 0},
        {Parse<CGroupInfoPDU>, 1, "<grouphandle>1</grouphandle>", 0},
        {Parse<CRosterInfoPDU>, 5, "", 1},
        {Parse<CRosterInfoPDU>, 4, "", 0},
        {Parse<CFAQMacroInfoPDU>, 8, "", 1},
        {Parse<CFAQMacroInfoPDU>, 11, "<fname>Bo</fname>", 0},
        {Parse<CCustomerIdPDU>, 11, "<customerid>0</customerid>", 1},
        {Parse<CCustomerIdPDU>, 11, "<customerid></customerid>", 0},
        {Parse<CCustomerIdPDU>, 10, "<customerid>5</customerid>", 0},
        {Parse<CPrimCustNodeIdPDU>, 10, "<primcust>4096</primcust>", 1},
        {Parse<CPrimCustNodeIdPDU>, 10, "", 0},
    };
    for (const auto& [parse, type, body, result] : cases)
        EXPECT_EQ(parse(Chat(type, body)), result) << type << ": " << body;
}

TEST(Reading, MissingOptionalElementsLeaveFieldsEmptyAndOnlyTheFirstOfANameCounts) {
    CGroupMessagePDU group;
    ASSERT_EQ(group.ParseXMLPDU(Chat(3, "<sendid>9</sendid><groupid>15</groupid><message/>")), 1);
    EXPECT_EQ(group.GetSenderName(), "");
    EXPECT_EQ(group.GetMessageContent(), "");
    EXPECT_EQ(group.GetGroupCacheId_DWORD(), 0u);
    // The first element of a name and its first CDATA section count.
    ASSERT_EQ(group.ParseXMLPDU(Chat(3,
                                     "<message><![CDATA[one]]><![CDATA[two]]></message>"
                                     "<groupid>15</groupid><sendid>7</sendid><sendid>8</sendid>")),
              1);
    EXPECT_EQ(group.GetMessageContent(), "one");
    EXPECT_EQ(group.GetSendID(), "7");

    CRosterInfoPDU roster;
    ASSERT_EQ(roster.ParseXMLPDU(Chat(5, "")), 1);
    EXPECT_EQ(roster.GetUserNameW(), "");
    EXPECT_EQ(roster.GetVisible_BOOL(), 0);

    // A failed read keeps what it read before failing.
    CPrivateMessagePDU partial;
    EXPECT_EQ(partial.ParseXMLPDU(Chat(2, "<sendid>7</sendid><SenderName>Ann</SenderName>")), 0);
    EXPECT_EQ(partial.GetSendID(), "7");
    EXPECT_EQ(partial.GetSenderName(), "Ann");
}

// A group message widens its end markers only when printed (its wire bytes pin that).
TEST(Reading, EndMarkersAreWidenedOnSetForPrivateMessagesOnly) {
    CPrivateMessagePDU privateMessage;
    privateMessage.SetMessageContent("]]>a]]>b]]>]]>");
    EXPECT_EQ(privateMessage.GetMessageContent(), "]] >a]] >b]] >]] >");
    CGroupMessagePDU group;
    group.SetMessageContent("]]>a]]>b]]>]]>");
    EXPECT_EQ(group.GetMessageContent(), "]]>a]]>b]]>]]>");
}

TEST(Reading, TheCacheHandleValueComesOnlyFromTheNumberSetter) {
    CGroupMessagePDU pdu;
    pdu.SetGroupCacheId(4097u);
    pdu.SetGroupCacheId("12");
    EXPECT_EQ(pdu.GetGroupCacheIdValue(), 4097u);
    CGroupMessagePDU read;
    ASSERT_EQ(read.ParseXMLPDU(Chat(3,
                                    "<sendid>7</sendid><groupid>15</groupid>"
                                    "<GroupCacheId>4097</GroupCacheId><message/>")),
              1);
    EXPECT_EQ(read.GetGroupCacheIdValue(), 0u);
}

TEST(Reading, OneFaqObjectTakesEveryConfigurationAndKeepsWhatALaterOneLacks) {
    CFAQMacroInfoPDU pdu;
    ASSERT_EQ(pdu.ParseXMLPDU(Chat(8,
                                   "<fname>Ann</fname><lname>Lee</lname>"
                                   "<phone>+1 &amp; 2</phone><email>a@example.org</email>")),
              1);
    ASSERT_EQ(pdu.ParseXMLPDU(Chat(8, "<fname></fname><email>b@example.org</email>")), 1);
    EXPECT_EQ(pdu.GetFirstName(), "Ann");
    EXPECT_EQ(pdu.GetLastName(), "Lee");
    EXPECT_EQ(pdu.GetPhoneNumber(), "+1 & 2");
    EXPECT_EQ(pdu.GetEmailAddress(), "b@example.org");
    EXPECT_EQ(pdu.ParseXMLPDU(Chat(11, "<fname>Bo</fname>")), 0);
    EXPECT_EQ(pdu.GetFirstName(), "Ann");
}
