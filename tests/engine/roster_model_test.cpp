#include <gtest/gtest.h>

#include <cstring>
#include <memory>
#include <string>

#include "engine/user_list_manager.h"

namespace {

std::unique_ptr<UserItem> MakeUser(std::uint32_t nodeId, std::uint32_t userId, const char* name,
                                   std::uint32_t roles) {
    std::unique_ptr<UserItem> item(new UserItem);
    item->dwNodeID = nodeId;
    item->dwUserID = userId;
    item->strName.CopyFrom(name);
    item->dwRoles = roles;
    return item;
}

// Host 10, presenter 20, panelist 30, attendee 40, and 50 with all three roles.
void FillRoster(CUserListManager& list) {
    list.AddItem(MakeUser(10, 110, "Hal", 0x1));
    list.AddItem(MakeUser(20, 120, "Pia", 0x2));
    list.AddItem(MakeUser(30, 130, "Pan", 0x4));
    list.AddItem(MakeUser(40, 140, "Ann", 0x0));
    list.AddItem(MakeUser(50, 150, "All", 0x7));
}

}  // namespace

TEST(UserItem, StartsWithTheRosterDefaults) {
    const UserItem item;
    EXPECT_EQ(item.dwReserved1, 100u);
    EXPECT_EQ(item.dwReserved2, 0u);
    EXPECT_EQ(item.bVisible, 1);
    EXPECT_EQ(item.dwReserved3, 1u);
    EXPECT_EQ(item.dwRoles, 0u);
    EXPECT_EQ(item.dwNodeID, 0u);
    EXPECT_EQ(item.strName.GetData(), nullptr);
    const char zeros[sizeof(item.szSpare)] = {};
    EXPECT_EQ(std::memcmp(item.szSpare, zeros, sizeof(zeros)), 0);
}

TEST(CUserListManager, UnknownNodeGivesNotFoundAndNonStrictPanelistYes) {
    for (int filled = 0; filled < 2; ++filled) {
        SCOPED_TRACE(filled ? "roster without the node" : "empty roster");
        CUserListManager list;
        if (filled) FillRoster(list);
        EXPECT_EQ(list.IsHost(99), 2u);
        EXPECT_EQ(list.IsPresenter(99), 2u);
        EXPECT_EQ(list.IsAttendee(99), 2u);
        EXPECT_EQ(list.IsPanelist(99, true), 2u);
        EXPECT_EQ(list.IsPanelist(99, false), 1u);
        EXPECT_EQ(list.SetRosters(99, 0x1), 2);
        EXPECT_EQ(list.SetHost(99), 2);
        EXPECT_EQ(list.SetAttendee(99, 1), 2);
        EXPECT_EQ(list.RemoveItem(99), 2);
        EXPECT_EQ(list.ModifyItemName(99, "x"), 2);
        EXPECT_EQ(list.ModifyItemGrp(99, 1, "x", "y"), 2);
        EXPECT_EQ(list.GetUserItemFromNodeId(99), nullptr);
        std::uint32_t out = 7;
        EXPECT_EQ(list.GetNodeIdFromUserId(199, out), 0);
        EXPECT_EQ(list.GetUserIdFromNodeId(99, out), 0);
        EXPECT_EQ(out, 7u);
    }
}

TEST(CUserListManager, RoleQueriesAnswerTheBitValue) {
    CUserListManager list;
    FillRoster(list);
    struct Case {
        std::uint32_t node;
        std::uint32_t host, presenter, attendee, strictPanelist, panelist;
    };
    const Case cases[] = {
        {10, 1, 0, 0, 0, 1},  // host
        {20, 0, 2, 0, 0, 1},  // presenter
        {30, 0, 0, 0, 4, 1},  // panelist
        {40, 0, 0, 0, 0, 0},  // attendee
        {50, 1, 2, 0, 4, 1},  // all three
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.node);
        EXPECT_EQ(list.IsHost(c.node), c.host);
        EXPECT_EQ(list.IsPresenter(c.node), c.presenter);
        EXPECT_EQ(list.IsAttendee(c.node), c.attendee);
        EXPECT_EQ(list.IsPanelist(c.node, true), c.strictPanelist);
        EXPECT_EQ(list.IsPanelist(c.node, false), c.panelist);
    }
    EXPECT_EQ(list.JudgeRosters(50, 0x6), 6u);
}

TEST(CUserListManager, RoleSettersReplaceTheWholeRoleSet) {
    CUserListManager list;
    FillRoster(list);
    EXPECT_EQ(list.SetHost(20), 1);  // the presenter becomes host only
    EXPECT_EQ(list.GetUserItemFromNodeId(20)->dwRoles, 1u);
    EXPECT_EQ(list.SetPresenter(50), 1);
    EXPECT_EQ(list.GetUserItemFromNodeId(50)->dwRoles, 2u);
    EXPECT_EQ(list.SetPanelist(40, 1), 1);
    EXPECT_EQ(list.GetUserItemFromNodeId(40)->dwRoles, 4u);
    EXPECT_EQ(list.SetAttendee(40, 1), 1);
    EXPECT_EQ(list.GetUserItemFromNodeId(40)->dwRoles, 0u);
    EXPECT_EQ(list.SetAttendee(40, 0), 1);
    EXPECT_EQ(list.GetUserItemFromNodeId(40)->dwRoles, 4u);
    EXPECT_EQ(list.SetPanelist(10, 0), 1);
    EXPECT_EQ(list.GetUserItemFromNodeId(10)->dwRoles, 0u);
}

TEST(CUserListManager, JudgeRostersCopiesTheFoundParticipant) {
    CUserListManager list;
    FillRoster(list);
    UserItem out;
    EXPECT_EQ(list.IsPresenter(50, &out), 2u);
    EXPECT_EQ(out.dwRoles, 7u);
    EXPECT_EQ(out.dwNodeID, 50u);
    EXPECT_EQ(out.dwUserID, 150u);
    EXPECT_STREQ(out.strName.GetData(), "All");
}

TEST(CUserListManager, LookupsTakeTheFirstMatchAndRemoveDeletesOnlyIt) {
    CUserListManager list;
    FillRoster(list);
    list.AddItem(MakeUser(30, 131, "Pan again", 0x0));
    EXPECT_EQ(list.AddItem(nullptr), 0);
    EXPECT_EQ(list.GetCount(), 6u);

    EXPECT_EQ(list.GetUserItemFromNodeId(30)->dwUserID, 130u);
    EXPECT_EQ(list.GetUserItemFromUserId(131)->dwNodeID, 30u);
    std::uint32_t id = 0;
    EXPECT_EQ(list.GetNodeIdFromUserId(140, id), 1);
    EXPECT_EQ(id, 40u);
    EXPECT_EQ(list.GetUserIdFromNodeId(30, id), 1);
    EXPECT_EQ(id, 130u);
    EXPECT_EQ(list.GetHosUser()->dwNodeID, 10u);
    EXPECT_EQ(list.GetUserItemByIndex(5)->dwUserID, 131u);
    EXPECT_EQ(list.GetUserItemByIndex(6), nullptr);

    EXPECT_EQ(list.RemoveItem(30), 1);
    EXPECT_EQ(list.GetCount(), 5u);
    EXPECT_EQ(list.GetUserItemFromNodeId(30)->dwUserID, 131u);
    EXPECT_EQ(list.RemoveItem(10), 1);
    EXPECT_EQ(list.GetHosUser()->dwNodeID, 50u);
}

TEST(CUserListManager, NameChangesNeedANameAndGroupChangesChangeNothing) {
    CUserListManager list;
    FillRoster(list);
    EXPECT_EQ(list.ModifyItemName(40, nullptr), 0);
    EXPECT_EQ(list.ModifyItemName(40, "Anna"), 1);
    EXPECT_STREQ(list.GetUserItemFromNodeId(40)->strName.GetData(), "Anna");

    EXPECT_EQ(list.ModifyItemGrp(40, 8, nullptr, "label"), 0);
    EXPECT_EQ(list.ModifyItemGrp(40, 8, "name", nullptr), 0);
    EXPECT_EQ(list.ModifyItemGrp(40, 8, "name", "label"), 1);
    EXPECT_STREQ(list.GetUserItemFromNodeId(40)->strName.GetData(), "Anna");
    EXPECT_EQ(list.GetUserItemFromNodeId(40)->dwRoles, 0u);
}
