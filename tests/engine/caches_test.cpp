// Group caches on the in-process conference: which caches each role subscribes to, how a role
// change moves the subscriptions, when a request is refused, what the cache-action
// confirmations set in motion, and the lookups between cache names, handles and group ids.
#include <gtest/gtest.h>

#include <cstring>
#include <optional>
#include <set>
#include <tuple>
#include <utility>

#include "engine/chat_recovery_mgr.h"
#include "tests/engine/chat_room.h"
#include "tests/engine/menu_harness.h"
#include "tests/support/spy_arm_client.h"
#include "tests/support/trace_capture.h"

namespace {

constexpr std::uint32_t kSessionId = 42, kMyNode = 7, kOtherNode = 9;
// A host-added group at the top of the id range that still names a group cache.
constexpr std::uint32_t kHighGroupId = 4096;

using IdSet = std::set<std::uint32_t>;

// One participant on its own conference, started in meeting type 3 with the groups 7 and 4096
// added, and answered until it is enrolled with its caches initialised.
struct Participant {
    // refuseUserInfoSet: the service refuses the first cache set, the user-info cache's.
    explicit Participant(bool refuseUserInfoSet = false) {
        RecordingWindow::Install();
        if (refuseUserInfoSet) client->ConfirmNextWith(ArmConfirmation::ApeCacheActionConfirmEx, 7);
        engine.Initialize(chatroom::StartRecord(&spy, conference.ConferenceId(), kSessionId,
                                                "Alice", kMyNode, 3));
        for (std::uint32_t id : {GROUP_HOST_PRESENTER_PANELISTS, kHighGroupId})
            menutest::AddGroup(engine, 100, 1, id, "Added", 0);
        loop.RunUntilIdle();
    }
    ~Participant() { RecordingWindow::Uninstall(); }

    // The ids of the groups 1, 2, 3, 4, 7, 8 and 15 that are subscribed now.
    IdSet Subscribed() {
        IdSet ids;
        for (std::uint32_t id : {1u, 2u, 3u, 4u, 7u, 8u, 15u}) {
            int subscribed = 0, requestType = 0, cacheSet = 0;
            EXPECT_TRUE(engine.GetGroupCacheStatus(id, subscribed, requestType, cacheSet)) << id;
            if (subscribed) ids.insert(id);
        }
        return ids;
    }

    VirtualRunLoop loop;
    ScopedCurrentRunLoop current{&loop};
    InProcessConference conference;
    InProcessArmClient* client = conference.CreateClient(loop, kMyNode);
    SpyArmClient spy{client};
    CChatClient engine;
};

TEST(Caches, EachRoleSubscribesTheCachesItMayReadAndARoleChangeMovesThem) {
    Participant p;
    ASSERT_EQ(p.Subscribed(), (IdSet{15, 8}));
    constexpr std::uint32_t kAsBefore = ~0u;
    // Each step: who holds host and presenter, the rosters (kAsBefore: no roster change, the
    // subscriptions re-made from the role before), and the caches then subscribed.
    const std::tuple<const char*, std::uint32_t, std::uint32_t, std::uint32_t, IdSet> steps[] = {
        // Becoming host re-subscribes by the new role at once: the attendees' cache goes, the
        // host's, host-and-presenter's and the panelists' come.
        {"attendee becomes host", kMyNode, 0, kAsBefore, {15, 1, 3, 4, 7}},
        {"host also becomes presenter", kMyNode, kMyNode, kAsBefore, {15, 1, 2, 3, 4, 7}},
        // Still presenter (and panelist): host-and-presenter stays.
        {"host role moves away", kOtherNode, kMyNode, kAsBefore, {15, 2, 3, 4, 7}},
        // A presenter outside the chat roster changes no subscription by itself; the move
        // from the previous role takes the presenter's cache and brings the attendees'.
        {"presenter role moves away", kOtherNode, kOtherNode, kAsBefore, {15, 3, 4, 7, 8}},
        {"presenter again", kOtherNode, kMyNode, kAsBefore, {15, 2, 3, 4, 7}},
        {"host again", kMyNode, kMyNode, kAsBefore, {15, 1, 2, 3, 4, 7}},
        // Subscribing by the rosters gives up what the previous role read.
        {"host", kMyNode, kOtherNode, ROLE_HOST | ROLE_PANELIST, {15, 1, 4, 3, 7}},
        {"presenter", kOtherNode, kMyNode, ROLE_PRESENTER | ROLE_PANELIST, {15, 2, 4, 3, 7}},
        {"both", kMyNode, kMyNode, ROLE_HOST | ROLE_PRESENTER | ROLE_PANELIST, {15, 1, 2, 3, 4, 7}},
        {"panelist", kOtherNode, kOtherNode, ROLE_PANELIST, {15, 4, 7}},
        {"attendee", kOtherNode, kOtherNode, 0, {15, 8}},
        {"attendee, no role held", 0, 0, 0, {15, 8}},
    };
    std::uint32_t host = 0, presenter = 0;
    for (const auto& [role, hostId, presenterId, rosters, subscribed] : steps) {
        SCOPED_TRACE(role);
        // A re-subscription moves from the role before the one change the row makes.
        const bool both = rosters != kAsBefore;
        if (both || hostId != host) p.engine.OnHostChanged(host = hostId);
        if (both || presenterId != presenter) p.engine.OnPresenterChanged(presenter = presenterId);
        if (both) {
            p.engine.SetRosters(rosters, 1);
            p.engine.SubscribeAllGroupCaches();
        } else {
            p.engine.ReSubscribeGroupCaches();
        }
        EXPECT_EQ(p.Subscribed(), subscribed);
    }
}

TEST(Caches, ARequestIsSentOnlyWhenItWouldChangeTheSubscription) {
    Participant p;
    const tagCacheRequestType kSub = CACHE_REQUEST_SUBSCRIBE, kUnsub = CACHE_REQUEST_UNSUBSCRIBE,
                              kRead = CACHE_REQUEST_RETRIEVE;
    // Each request: the group, subscribe (else unsubscribe) with which type, whether the
    // service refuses it (a later request may retry), the result (1: sent), and the group's
    // subscription and request type after it.
    const std::tuple<const char*, std::uint32_t, bool, tagCacheRequestType, bool, int, int, int>
        cases[] = {
            {"subscribed with the same type", GROUP_EVERYONE, true, kSub, false, 0, 1, kSub},
            {"subscribed, another type", GROUP_EVERYONE, true, kRead, false, 1, 1, kRead},
            {"refused unsubscribe", GROUP_EVERYONE, false, kUnsub, true, 1, 1, kRead},
            {"unsubscribe", GROUP_EVERYONE, false, kUnsub, false, 1, 0, kUnsub},
            {"unsubscribe again", GROUP_EVERYONE, false, kUnsub, false, 0, 0, kUnsub},
            {"subscribe after unsubscribing", GROUP_EVERYONE, true, kSub, false, 1, 1, kSub},
            {"never subscribed, unsubscribe", GROUP_HOST, false, kUnsub, false, 0, 0, 0},
        };
    for (const auto& [request, groupId, subscribe, type, refused, sent, subscribedAfter,
                      typeAfter] : cases) {
        SCOPED_TRACE(request);
        if (refused) p.client->FailNext(ArmOperation::ApeRequestSharedDataEx, 5);
        TraceCapture capture;
        const std::size_t before = p.spy.Count("ApeRequestSharedDataEx");
        EXPECT_EQ(subscribe ? p.engine.SubscribeGroupCache(groupId, type)
                            : p.engine.UnSubscribeGroupCache(groupId),
                  sent);
        EXPECT_EQ(p.spy.Count("ApeRequestSharedDataEx") - before, static_cast<std::size_t>(sent));
        int subscribed = 0, requestType = 0, cacheSet = 0;
        ASSERT_TRUE(p.engine.GetGroupCacheStatus(groupId, subscribed, requestType, cacheSet));
        EXPECT_EQ(subscribed, subscribedAfter);
        EXPECT_EQ(requestType, typeAfter);
        EXPECT_EQ(
            capture.Has(TraceLevel::Warn,
                        "CChatClient::UnSubscribeGroupCache ApeRequestSharedDataEx return !0"),
            refused);
    }
    // A group without a cache (a separator, an unknown id) is never asked for.
    const std::size_t before = p.spy.Count("ApeRequestSharedDataEx");
    EXPECT_EQ(p.engine.SubscribeGroupCache(0, CACHE_REQUEST_SUBSCRIBE), 0);
    EXPECT_EQ(p.engine.SubscribeGroupCache(99, CACHE_REQUEST_SUBSCRIBE), 0);
    EXPECT_EQ(p.spy.Count("ApeRequestSharedDataEx"), before);
}

TEST(Caches, CachesNeverMarkedSetAreNeverSubscribed) {
    // The user-info cache's initialisation is refused, so the status cache is never marked
    // and no group cache is known to be set.
    Participant p(true);
    ASSERT_EQ(p.engine.State(), kStateEnrolled);
    TraceCapture capture;
    p.spy.ClearCalls();
    p.engine.OnHostChanged(kMyNode);
    EXPECT_EQ(p.engine.SubscribeGroupCache(GROUP_EVERYONE, CACHE_REQUEST_SUBSCRIBE), 0);
    p.engine.SubscribeAllGroupCaches();
    p.engine.ReSubscribeGroupCaches();
    EXPECT_EQ(p.spy.Count("ApeRequestSharedDataEx"), 0u);
    EXPECT_TRUE(capture.Has(
        TraceLevel::Warn, "CChatClient::SubscribeGroupCache , dwGroupID=15, dwGroupCacheHandle = " +
                              std::to_string(p.engine.GetCacheHandleFormGroupId(15)) +
                              ", bSubscribed = 0, bCacheSet = 0"));
    EXPECT_EQ(p.Subscribed(), IdSet{});
}

TEST(Caches, CacheActionConfirmationsDriveTheNextStep) {
    enum Entity { kUserInfo, kStatus, kGroupCache, kNoEntity };
    // Each confirmation: its entity, action, result, whether the ape handle is 0 and whether
    // recovery runs; then the cache actions sent in answer, the caches subscribed (the local
    // participant became panelist just before) and whether they were re-subscribed.
    // The user info's set marks the status cache and writes the own info; either set then
    // subscribes by role, or only to everyone's cache while recovering.
    const std::tuple<const char*, Entity, tagCacheAction, short, bool, bool, std::size_t, IdSet,
                     bool>
        cases[] = {
            {"user info set", kUserInfo, CACHE_SET, 0, false, false, 2, {15, 4, 7}, true},
            {"user info set, recovering", kUserInfo, CACHE_SET, 0, false, true, 2, {15, 8}, false},
            {"status set", kStatus, CACHE_SET, 0, false, false, 0, {15, 4, 7}, false},
            {"status set, recovering", kStatus, CACHE_SET, 0, false, true, 0, {15, 8}, false},
            {"an append", kUserInfo, CACHE_APPEND, 0, false, false, 0, {15, 8}, false},
            {"a refused set", kUserInfo, CACHE_SET, 3, false, false, 0, {15, 8}, false},
            {"no ape handle", kUserInfo, CACHE_SET, 0, true, false, 0, {15, 8}, false},
            {"no entity", kNoEntity, CACHE_SET, 0, false, false, 0, {15, 8}, false},
            {"a group cache's set", kGroupCache, CACHE_SET, 0, false, false, 0, {15, 8}, false},
        };
    for (const auto& [confirmation, kind, action, result, zeroApe, recovering, writes, subscribed,
                      resubscribed] : cases) {
        SCOPED_TRACE(confirmation);
        Participant p;
        if (recovering) p.engine.RecoveryMgr()->InitParameters(&p.engine, 0x400 | 0x200000);
        // Panelist now, but not yet subscribed as one.
        p.engine.SetRosters(ROLE_PANELIST, 1);

        std::uint32_t entity = p.engine.GetCacheHandleFormGroupId(GROUP_HOST);
        if (kind == kUserInfo) entity = p.engine.UserInfoCacheHandle().handle_value;
        if (kind == kStatus) entity = p.engine.ChatStatusCacheHandle().handle_value;
        if (kind == kNoEntity) entity = 0;
        TraceCapture capture;
        p.spy.ClearCalls();
        p.engine.ApeCacheActionConfirmEx(zeroApe ? 0 : p.client->ApeHandle(), entity, action, 1, 1,
                                         result);
        EXPECT_EQ(p.spy.Count("ApeSharedDataActionEx"), writes);
        EXPECT_EQ(p.Subscribed(), subscribed);
        EXPECT_EQ(capture.Has("Enter CChatClient::ReSubscribeGroupCaches"), resubscribed);
    }
}

TEST(Caches, InitialisingSetsEveryCacheFromOneSharedBlock) {
    for (const std::uint32_t customerId : {0u, 5000u}) {
        SCOPED_TRACE(customerId);
        Participant p;
        if (customerId != 0) {
            // The customer cache's handle comes with a second request for the handles; with
            // the handles of the first answer known, its entries still go out zero-filled
            // apart from their names.
            p.engine.RecoveryMgr()->SetCustomerId(customerId);
            ASSERT_EQ(p.engine.AllocAllNeededCacheHandle(), 1);
            for (const NameHandle& entry : p.spy.HandleRequests().back()) {
                EXPECT_EQ(entry.handle_value, 0u) << entry.name;
                const std::size_t length = strnlen(entry.name, sizeof entry.name);
                EXPECT_EQ(std::string(entry.name + length, sizeof entry.name - length),
                          std::string(sizeof entry.name - length, '\0'))
                    << entry.name;
            }
            p.loop.RunUntilIdle();
            ASSERT_NE(p.engine.CustomerCacheHandle().handle_value, 0u);
        }
        // Seven role groups, the two added groups and the user-info cache.
        const std::size_t caches = 10;
        const std::size_t blocks = p.client->MemHandleCount();
        p.spy.ClearCalls();
        p.engine.SetAllCaches();

        std::vector<std::string> expected = {"AllocMemHandle", "WriteMemHandle"};
        expected.insert(expected.end(), caches, "ApeSharedDataActionEx");
        if (customerId != 0) {
            // The customer cache is set from a block of its own, inside the shared one's life.
            expected.insert(expected.end(), {"AllocMemHandle", "WriteMemHandle",
                                             "ApeSharedDataActionEx", "FreeMemHandle"});
        }
        expected.push_back("FreeMemHandle");
        EXPECT_EQ(p.spy.Calls(), expected);
        EXPECT_EQ(p.client->MemHandleCount(), blocks);
    }
}

TEST(Caches, TheStatusCacheAnswerDecidesWhetherToInitialiseOrJoin) {
    const std::vector<std::uint8_t> mark = {'1', '\0'};
    // Each answer: its action, result and item; whether the engine then initialises every
    // cache, joins (own user info written, subscriptions by role) and warns.
    const std::tuple<const char*, tagCacheAction, short, std::optional<std::vector<std::uint8_t>>,
                     bool, bool, bool>
        cases[] = {
            {"the mark", CACHE_REPLY_LAST, 0, mark, false, true, false},
            {"nothing stored", CACHE_REPLY_LAST, 0, std::nullopt, true, false, false},
            {"an empty item", CACHE_REPLY_LAST, 0, std::vector<std::uint8_t>{}, true, false, false},
            {"never set", CACHE_REPLY_LAST, kArmRetry, std::nullopt, true, false, true},
            {"another error", CACHE_REPLY_LAST, 5, std::nullopt, false, false, false},
            {"not the last answer", CACHE_REPLY_ITEM, 0, mark, false, false, false},
            {"an append", CACHE_APPEND, kArmRetry, std::nullopt, false, false, false},
        };
    for (const auto& [answer, action, result, data, initialises, joins, warns] : cases) {
        SCOPED_TRACE(answer);
        Participant p;
        ArmCacheDelivery delivery;
        delivery.entityId = p.engine.ChatStatusCacheHandle().handle_value;
        delivery.action = action;
        delivery.result = result;
        TraceCapture capture;
        p.spy.ClearCalls();
        ASSERT_TRUE(p.client->InjectCacheDelivery(delivery, data));
        p.loop.RunUntilIdle();
        EXPECT_TRUE(capture.Has("CChatClient::SharedDataReceivedEx chat status cache ----/"));
        EXPECT_EQ(capture.Has("Enter CChatClient::SetAllCaches"), initialises);
        EXPECT_EQ(capture.Has("Enter CChatClient::SubscribeAllGroupCaches"), joins || initialises);
        EXPECT_EQ(capture.Has("CChatClient::SetAllGroupCacheSetFlag()"), joins || initialises);
        EXPECT_EQ(capture.Has(TraceLevel::Warn,
                              "CChatClient::SharedDataReceivedEx:entity_id == "
                              "m_ChatStatusCacheHandle.handle_value,result =19"),
                  warns);
        // Joining writes the own user info only; initialising sets every cache and more.
        if (!initialises) {
            EXPECT_EQ(p.spy.Count("ApeSharedDataActionEx"), joins ? 1u : 0u);
        }
    }
}

TEST(Caches, HandlesAndGroupIdsMapBothWays) {
    Participant p;
    const std::uint32_t high = p.engine.GetCacheHandleFormGroupId(kHighGroupId);
    ASSERT_NE(high, 0u);
    EXPECT_EQ(p.engine.GetGroupIdFormCacheHandle(high), kHighGroupId);
    // This lookup never answers for 4096, even though that group has a cache.
    EXPECT_EQ(p.engine.GetCacheHandleFromGroupId(kHighGroupId), 0u);
    EXPECT_EQ(p.engine.GetCacheHandleFromGroupId(15), p.engine.GetCacheHandleFormGroupId(15));
    EXPECT_EQ(p.engine.GetGroupIdFormCacheHandle(0), 0u);
    EXPECT_EQ(p.engine.GetGroupNameFromGroupCacheHandle(0), nullptr);
}

TEST(CacheNames, GroupIdIsTheNumberAfterTheLastUnderscore) {
    CChatClient engine;
    // Only eight characters after the underscore count.
    const std::pair<const char*, std::uint32_t> cases[] = {
        {"123_chat_cache_15", 15},     {"123_Chat_User_Info", 0},  {"123_chat_status", 0},
        {"123_chat_cache_4096", 4096}, {"123_chat_cache_4097", 0}, {"switch_cache_5000", 0},
        {"switch_cache_12", 12},       {"x_00000015", 15},         {"x_000000159", 15},
        {"123_chat_cache_", 0},        {"nounderscore15", 0},      {nullptr, 0}};
    for (const auto& [name, groupId] : cases)
        EXPECT_EQ(engine.GetGroupIdFormCacheName(name), groupId) << (name ? name : "null");
}

}  // namespace
