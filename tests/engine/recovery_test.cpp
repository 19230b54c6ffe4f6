// Chat history recovery on its own, against an engine stand-in: when it starts, what it asks
// the service for, in which order restored lines are shown, which copies are dropped, what is
// backed up, and how it ends when the everyone group's cache cannot be read.
#include <gtest/gtest.h>

#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "engine/chat_client.h"
#include "engine/chat_recovery_mgr.h"
#include "pdu/chat_user_info_pdu.h"
#include "pdu/group_message_pdu.h"
#include "pdu/private_message_pdu.h"
#include "tests/support/trace_capture.h"

namespace {

using Strings = std::vector<std::string>;

constexpr std::uint32_t kUserInfoCache = 501;
constexpr std::uint32_t kCustomerCache = 502;
constexpr std::uint32_t kEveryoneCache = 515;
constexpr std::uint32_t kRecovering = FEATURE_GROUP_MSG_RECOVERY | FEATURE_QM_MODE;

std::string UserInfo(std::uint32_t userId, const std::string& name) {
    CChatUserInfoPDU pdu;
    pdu.SetUserID(userId);
    pdu.SetUserName(name);
    pdu.GenerateXMLPDU();
    return pdu.ToWireText();
}

std::string GroupLine(std::uint32_t sendId, std::uint32_t groupId, std::uint32_t groupCacheId,
                      const std::string& text) {
    CGroupMessagePDU pdu;
    pdu.SetSendID(sendId);
    pdu.SetGroupID(groupId);
    if (groupCacheId != 0) pdu.SetGroupCacheId(groupCacheId);
    pdu.SetMessageContent(text);
    pdu.GenerateXMLPDU();
    return pdu.ToWireText();
}

std::string PrivateLine(std::uint32_t sendId, std::uint32_t receiveId, const std::string& text) {
    CPrivateMessagePDU pdu;
    pdu.SetSendID(sendId);
    pdu.SetReveID(receiveId);
    pdu.SetMessageContent(text);
    pdu.GenerateXMLPDU();
    return pdu.ToWireText();
}

// A recovery manager wired to a stand-in for the engine: memory handles holding texts, the
// everyone group's cache, a live roster, and a record of what was requested (retrievals and
// the customer cache's setting), shown and copied.
// Showing a private line asks the manager for its title, as the engine does for a line between
// two others.
class Recovery final : public IChatDataCmdProcess {
public:
    explicit Recovery(std::uint32_t features = kRecovering) { mgr.InitParameters(this, features); }

    bool Start() { return mgr.CheckUpdate4CustomRecovery(kUserInfoCache, kCustomerCache); }
    void Roster(const std::string& text) { mgr.HandleHistoryUserRoster(Mem(text)); }
    void Customer(const std::string& text, tagCacheAction action = CACHE_REPLY_ITEM,
                  short result = 0) {
        mgr.HandleCustomerRecovery(0, kCustomerCache, Mem(text), result, action);
    }
    // One delivery on the everyone cache, offered as the engine offers it; false when the
    // manager left it to the live path.
    bool Everyone(std::uint32_t cacheId, const std::string& text,
                  tagCacheAction action = CACHE_REPLY_ITEM, std::uint32_t senderId = 0) {
        if (!mgr.CheckUpdate4GroupRecovery(kEveryoneCache)) return false;
        mgr.HandleGroupRecovery(cacheId, kEveryoneCache, Mem(text), 0, action, senderId);
        return true;
    }

    int ParseATMemHandle(std::uint32_t, char*, std::uint32_t*) override { return 0; }
    int ChatRequestSharedDataEx(std::uint32_t cacheHandle, tagCacheRequestType type,
                                short maxItems) override {
        requests.push_back(std::to_string(cacheHandle) + ":" + std::to_string(type) + ":" +
                           std::to_string(maxItems));
        return cacheHandle == kEveryoneCache ? everyoneResult : 0;
    }
    void SendCopyToCustomerCache(CKvoChatXMLPDU* pdu) override {
        copies.push_back(pdu->ToWireText());
    }
    void SetCustomerCache() override { requests.push_back("set customer cache"); }
    void ParseAndShowGroupMessages(CGroupMessagePDU* pdu, std::uint32_t cacheHandle) override {
        std::string name;  // restored lines carry no names
        mgr.ParseGroupSenderName(pdu, name);
        shown.push_back(name + "@" + pdu->GetGroupID() + ":" + pdu->GetMessageContent());
        EXPECT_EQ(cacheHandle, 0u);
    }
    int ParseAndShowPrivateMessages(CPrivateMessagePDU* pdu, int) override {
        std::string title;
        if (!mgr.ParsePrivateMsgTitle(pdu, title)) return -1;
        shown.push_back(title + ":" + pdu->GetMessageContent());
        return 0;
    }
    bool AllocStringForMemoryHandle(std::uint32_t memHandle, std::string& out) override {
        if (memHandle == 0 || memHandle > m_memory.size()) return false;
        out = m_memory[memHandle - 1];
        return true;
    }
    std::uint32_t GetGroupIdFormCacheName(const char*) override { return 0; }
    std::uint32_t GetGroupIdFormCacheHandle(std::uint32_t) override { return 0; }
    std::uint32_t GetCacheHandleFormGroupId(std::uint32_t groupId) override {
        return groupId == 15 ? everyoneCache : 0;
    }
    const char* GetGroupNameFromGroupCacheHandle(std::uint32_t) override { return nullptr; }
    int GetUserNameFromId(std::uint32_t userId, std::string& out) override {
        const auto found = liveRoster.find(userId);
        if (found == liveRoster.end()) return 0;
        out = found->second;
        return 1;
    }

    ChatRecoveryMgr mgr;
    std::map<std::uint32_t, std::string> liveRoster;
    std::uint32_t everyoneCache = kEveryoneCache;
    int everyoneResult = 0;  // the service's answer when the everyone group's cache is asked for
    Strings requests;
    Strings shown;
    Strings copies;

private:
    // A memory handle holding text: n for the nth text kept, 0 for none.
    std::uint32_t Mem(const std::string& text) {
        if (text.empty()) return 0;
        m_memory.push_back(text);
        return static_cast<std::uint32_t>(m_memory.size());
    }

    std::vector<std::string> m_memory;
};

}  // namespace

TEST(Recovery, StartsOnlyInQMModeWithGroupRecoveryOnceAndSetsACustomerCacheNeverSet) {
    for (const std::uint32_t features :
         {FEATURE_GROUP_MSG_RECOVERY, FEATURE_QM_MODE, kRecovering | 0x10000}) {
        SCOPED_TRACE(features);
        const bool starts = (features & kRecovering) == kRecovering;
        Recovery r(features);
        EXPECT_EQ(r.Start(), starts);
        EXPECT_FALSE(r.Start());
        EXPECT_EQ(r.mgr.CheckUpdate4GroupRecovery(kEveryoneCache), starts);
        // Nobody set the customer cache before: it is set once, and what it answered is not
        // shown. A manager that did not start takes nothing from it.
        r.Customer(PrivateLine(11, 12, "unread"), CACHE_REPLY_LAST, kArmRetry);
        EXPECT_EQ(r.requests,
                  starts ? Strings({"501:1:255", "502:1:255", "set customer cache", "515:1:255"})
                         : Strings());
        EXPECT_TRUE(r.shown.empty());
    }
}

TEST(Recovery, HistoryIsTheCustomerCacheTitledWithBothNamesThenTheEveryoneGroupByCacheId) {
    Recovery r;
    r.liveRoster[11] = "Ann";
    r.Start();
    r.Roster(UserInfo(12, "Bob (left)"));
    r.Roster(UserInfo(12, "Bob again"));  // the first record of an id names it
    r.Customer(PrivateLine(11, 12, "hi Bob"));
    r.Customer(PrivateLine(12, 13, "to nobody known"));
    r.Customer("\n" + PrivateLine(11, 12, "printed otherwise"));  // read the long way
    r.Customer(std::string(2, '\0'));  // the block the cache was initialised with
    r.Customer(GroupLine(11, 15, 5, "five"));
    // A later attendees line with a higher id of its own cache says nothing about group 15.
    r.Customer(GroupLine(12, 8, 12, "attendees"));
    r.Customer("", CACHE_REPLY_LAST);
    // Outside the customer cache a line between two others has no title and is not shown.
    CPrivateMessagePDU live;
    live.SetSendID(11u);
    live.SetReveID(12u);
    std::string title;
    EXPECT_EQ(r.mgr.ParsePrivateMsgTitle(&live, title), 0);

    EXPECT_TRUE(r.Everyone(7, GroupLine(12, 15, 0, "seven")));
    r.Everyone(5, GroupLine(11, 15, 0, "five"));
    r.Everyone(9, GroupLine(11, 15, 0, "nine"), CACHE_REPLY_LAST);
    EXPECT_EQ(r.shown,
              Strings({"from Ann to Bob (left) (privately):hi Bob",
                       "from Bob (left) to  (privately):to nobody known",
                       "from Ann to Bob (left) (privately):printed otherwise", "Ann@15:five",
                       "Bob (left)@8:attendees", "Bob (left)@15:seven", "Ann@15:nine"}));
    // Each restored everyone line is backed up without names, with its cache id.
    EXPECT_EQ(r.copies, Strings({GroupLine(12, 15, 7, "seven"), GroupLine(11, 15, 9, "nine")}));
    EXPECT_FALSE(r.mgr.CheckUpdate4GroupRecovery(kEveryoneCache));  // live from now on
}

TEST(Recovery, EachLineIsShownOnceWhateverHoldsCopiesOfItAndAForgedOneNever) {
    Recovery r;
    r.liveRoster = {{11, "Ann"}, {12, "Bob"}};
    r.Start();
    r.mgr.NoteLiveGroupMessage(8, 4);
    // Every receiver copied the attendees line 3 and the line 4 shown live; the sender and
    // the receiver each copied the private line; "ok" was really said twice.
    for (const std::uint32_t cacheId : {3u, 4u, 3u, 4u, 3u, 4u})
        r.Customer(GroupLine(11, 8, cacheId, "line " + std::to_string(cacheId)));
    for (int copy = 0; copy < 4; ++copy)
        r.Customer(PrivateLine(11, 12, "ok"));
    r.Customer("", CACHE_REPLY_LAST);
    // Live everyone lines meanwhile join the history, each cache id once; one whose sender is
    // not the one the service names is dropped.
    TraceCapture trace;
    r.Everyone(21, GroupLine(12, 15, 0, "live"), CACHE_APPEND);
    r.Everyone(20, GroupLine(11, 15, 0, "old"));
    r.Everyone(21, GroupLine(12, 15, 0, "live"));
    r.Everyone(21, GroupLine(12, 15, 0, "live"), CACHE_APPEND);
    r.Everyone(23, GroupLine(11, 15, 0, "forged"), CACHE_APPEND, 12);
    r.Everyone(22, GroupLine(12, 15, 0, "after"), CACHE_REPLY_LAST, 12);
    EXPECT_EQ(r.shown, Strings({"Ann@8:line 3", "from Ann to Bob (privately):ok",
                                "from Ann to Bob (privately):ok", "Ann@15:old", "Bob@15:live",
                                "Bob@15:after"}));
    EXPECT_TRUE(trace.Has(TraceLevel::Warn,
                          "CChatClient::SharedDataReceivedEx,CACHE_APPEND or CACHE_SET,Detect "
                          "faked group message, senderId:12, senderId in PDU:11"));
}

TEST(Recovery, PrivateCopiesAreMatchedWithinTheLastSixteenLines) {
    RecoveredMessageFilter filter;
    for (std::uint32_t i = 0; i <= RecoveredMessageFilter::kPrivateWindow; ++i)
        EXPECT_TRUE(filter.FirstShowOfPrivateMessage(1, 2, std::to_string(i)));
    EXPECT_TRUE(filter.FirstShowOfPrivateMessage(1, 2, "0"));   // 17 lines back: a new line
    EXPECT_FALSE(filter.FirstShowOfPrivateMessage(1, 2, "2"));  // 15 lines back: a copy
    EXPECT_TRUE(filter.FirstShowOfPrivateMessage(2, 1, "3"));   // the other direction
}

TEST(Recovery, AnEveryoneCacheThatCannotBeReadEndsRecoveryAndShowsWhatWasHeld) {
    // The everyone group's cache is refused, or the group has none.
    for (const std::uint32_t everyoneCache : {kEveryoneCache, 0u}) {
        SCOPED_TRACE(everyoneCache);
        TraceCapture trace;
        Recovery r;
        r.everyoneCache = everyoneCache;
        r.everyoneResult = 1103;
        r.Start();
        // Only an everyone group with a cache has deliveries to hold.
        EXPECT_EQ(r.Everyone(30, GroupLine(11, 15, 0, "held"), CACHE_APPEND), everyoneCache != 0);
        r.Customer("", CACHE_REPLY_LAST);
        EXPECT_FALSE(r.mgr.IsRecoveryRunning());
        EXPECT_TRUE(
            trace.Has(TraceLevel::Warn, everyoneCache != 0
                                            ? "ChatRecoveryMgr: cache of group 15 (handle 515) "
                                              "not read (result 1103); recovery ends"
                                            : "ChatRecoveryMgr: cache of group 15 (handle 0) "
                                              "not read (result 0); recovery ends"));
        // Nothing is lost: what was held is shown once recovery can no longer add to it.
        EXPECT_EQ(r.shown, everyoneCache != 0 ? Strings({"@15:held"}) : Strings());
    }
}
