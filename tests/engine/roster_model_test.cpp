// The roster list itself: role queries and their result codes, lookups by node and user id,
// and the counts and indexes kept as items move, change roles or leave.
#include <gtest/gtest.h>

#include <memory>
#include <tuple>

#include "engine/user_list_manager.h"

namespace {

// Host 10, presenter 20, panelist 30, attendee 40, and 50 with all three roles; user id =
// node + 100.
void FillRoster(CUserListManager& list) {
    const std::uint32_t roles[] = {0x1, 0x2, 0x4, 0x0, 0x7};
    for (std::uint32_t i = 0; i < 5; ++i) {
        std::unique_ptr<UserItem> item(new UserItem);
        item->dwNodeID = 10 * (i + 1);
        item->dwUserID = item->dwNodeID + 100;
        item->strName.CopyFrom("user");
        item->dwRoles = roles[i];
        list.AddItem(std::move(item));
    }
}

}  // namespace

TEST(CUserListManager, UnknownNodeGivesNotFoundAndNonStrictPanelistYes) {
    for (int filled = 0; filled < 2; ++filled) {
        SCOPED_TRACE(filled ? "roster without the node" : "empty roster");
        CUserListManager list;
        if (filled) FillRoster(list);
        EXPECT_EQ(list.IsHost(99), 2u);
        EXPECT_EQ(list.IsAttendee(99), 2u);
        EXPECT_EQ(list.IsPanelist(99, true), 2u);
        EXPECT_EQ(list.IsPanelist(99, false), 1u);
        EXPECT_EQ(list.SetHost(99), 2);
        EXPECT_EQ(list.RemoveItem(99), 2);
        EXPECT_EQ(list.ModifyItemName(99, "x"), 2);
        EXPECT_EQ(list.ModifyItemGrp(99, 1, "x", "y"), 2);
        std::uint32_t out = 7;
        EXPECT_EQ(list.GetUserIdFromNodeId(99, out), 0);
        EXPECT_EQ(out, 7u);
    }
}

TEST(CUserListManager, RoleQueriesAnswerTheBitValue) {
    CUserListManager list;
    FillRoster(list);
    // Each case: node; what IsHost, IsPresenter, IsAttendee, strict and loose IsPanelist answer.
    const std::tuple<std::uint32_t, std::uint32_t, std::uint32_t, std::uint32_t, std::uint32_t,
                     std::uint32_t>
        cases[] = {
            {10, 1, 0, 0, 0, 1}, {20, 0, 2, 0, 0, 1}, {30, 0, 0, 0, 4, 1},
            {40, 0, 0, 0, 0, 0}, {50, 1, 2, 0, 4, 1},
        };
    for (const auto& [node, host, presenter, attendee, strictPanelist, panelist] : cases) {
        SCOPED_TRACE(node);
        EXPECT_EQ(list.IsHost(node), host);
        EXPECT_EQ(list.IsPresenter(node), presenter);
        EXPECT_EQ(list.IsAttendee(node), attendee);
        EXPECT_EQ(list.IsPanelist(node, true), strictPanelist);
        EXPECT_EQ(list.IsPanelist(node, false), panelist);
    }
    UserItem out;
    EXPECT_EQ(list.JudgeRosters(50, 0x6, &out), 6u);
    EXPECT_EQ(out.dwRoles, 7u);
    EXPECT_EQ(out.dwUserID, 150u);
    EXPECT_STREQ(out.strName.GetData(), "user");
}

TEST(CUserListManager, LookupsTakeTheFirstMatchAndRemoveDeletesOnlyIt) {
    CUserListManager list;
    FillRoster(list);
    std::unique_ptr<UserItem> twin(new UserItem);
    twin->dwNodeID = 30;
    twin->dwUserID = 131;
    EXPECT_EQ(list.AddItem(std::move(twin)), 1);
    EXPECT_EQ(list.AddItem(nullptr), 0);

    EXPECT_EQ(list.GetUserItemFromNodeId(30)->dwUserID, 130u);
    std::uint32_t id = 0;
    EXPECT_EQ(list.GetNodeIdFromUserId(131, id), 1);
    EXPECT_EQ(id, 30u);
    EXPECT_EQ(list.GetUserItemByIndex(5)->dwUserID, 131u);
    EXPECT_EQ(list.GetUserItemByIndex(6), nullptr);

    EXPECT_EQ(list.RemoveItem(30), 1);
    EXPECT_EQ(list.GetCount(), 5u);
    EXPECT_EQ(list.GetUserItemFromNodeId(30)->dwUserID, 131u);
    EXPECT_EQ(list.RemoveItem(10), 1);
    EXPECT_EQ(list.GetHosUser()->dwNodeID, 50u);
    EXPECT_EQ(list.ModifyItemName(40, nullptr), 0);
    EXPECT_EQ(list.ModifyItemGrp(40, 8, "name", nullptr), 0);
}

TEST(CUserListManager, LookupsAndCountsFollowRoleAndIdChanges) {
    CUserListManager list;
    FillRoster(list);
    EXPECT_EQ(list.GetHostCount(), 2u);
    EXPECT_EQ(list.GetPrivilegedCount(), 4u);
    EXPECT_TRUE(list.HasUserOnNode(130, 30));
    EXPECT_FALSE(list.HasUserOnNode(130, 40));

    // The host at 10 becomes an attendee and moves to node 40, where an item already stands:
    // being earlier in the roster, it is now the one node 40 finds.
    UserItem moved;
    moved.dwNodeID = 40;
    moved.dwUserID = 110;
    moved.strName.CopyFrom("moved");
    EXPECT_EQ(list.UpdateItem(10, moved, false), 1);
    EXPECT_EQ(list.UpdateItem(99, moved, false), 2);
    EXPECT_EQ(list.GetUserItemFromNodeId(10), nullptr);
    EXPECT_STREQ(list.GetUserItemFromNodeId(40)->strName.GetData(), "moved");
    EXPECT_TRUE(list.HasUserOnNode(110, 40));
    EXPECT_FALSE(list.HasUserOnNode(110, 10));
    EXPECT_EQ(list.GetHostCount(), 1u);
    EXPECT_EQ(list.GetPrivilegedCount(), 3u);
    EXPECT_EQ(list.GetHosUser()->dwNodeID, 50u);

    EXPECT_EQ(list.SetAttendee(50, 1), 1);
    EXPECT_EQ(list.GetHostCount(), 0u);
    EXPECT_EQ(list.GetHosUser(), nullptr);
    EXPECT_EQ(list.RemoveItem(40), 1);  // the moved item goes; the original 40 answers again
    EXPECT_EQ(list.GetUserItemFromNodeId(40)->dwUserID, 140u);
    EXPECT_EQ(list.GetPrivilegedCount(), 2u);
}
