// Groups and the group list: reading a group from cache bytes (hostile ones included), flag
// schemes, cache records, look-ups, insertion schemes, row numbering, modify and delete.
#include <gtest/gtest.h>

#include <cstring>
#include <memory>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

#include "engine/users_group.h"
#include "engine/users_group_list.h"

namespace {

using Bytes = std::vector<unsigned char>;

// A role group: type 1, id 8, name "All Attendees", label "att", members 7 and 9.
const Bytes kRoleGroupBytes = {
    0x00, 0x00, 0x00, 0x01,                                    // type
    0x00, 0x00, 0x00, 0x08,                                    // id
    0x00, 0x00, 0x00, 0x0E, 'A',  'l',  'l',  ' ',  'A', 't',  // name, 14 bytes with the 0
    't',  'e',  'n',  'd',  'e',  'e',  's',  0x00,            //
    0x00, 0x00, 0x00, 0x04, 'a',  't',  't',  0x00,            // label
    0x00, 0x00, 0x00, 0x02,                                    // member count
    0x00, 0x00, 0x00, 0x07, 0x00, 0x00, 0x00, 0x09,            // members
};
// Offset of the member count in kRoleGroupBytes.
constexpr std::size_t kCountOffset = 34;

std::unique_ptr<CUsersGroup> MakeGroup(std::uint32_t type, std::uint32_t id, const char* name,
                                       std::int32_t members = 0) {
    std::unique_ptr<CUsersGroup> group(new CUsersGroup);
    group->SetGroupType(type);
    group->SetGroupId(id);
    group->SetGrpName(name);
    for (std::int32_t i = 0; i < members; ++i)
        group->AddAMember(1000 + id * 10 + i);
    return group;
}

// Appends a group and returns it.
CUsersGroup* Append(CUsersGroupList& list, std::unique_ptr<CUsersGroup> group) {
    CUsersGroup* raw = group.get();
    EXPECT_EQ(list.InsertGroup(static_cast<std::uint32_t>(list.GetGroupsCount()), std::move(group)),
              1);
    return raw;
}

std::vector<std::uint32_t> Ids(const CUsersGroupList& list) {
    std::vector<std::uint32_t> ids;
    for (std::int32_t i = 0; i < list.GetGroupsCount(); ++i)
        ids.push_back(list.GetGroupByIndex(i)->GetGroupId());
    return ids;
}

}  // namespace

TEST(CUsersGroup, FactNameWrapsTheGroupNameAndTakesMissingPartsAsEmpty) {
    CUsersGroup unnamed;
    EXPECT_STREQ(unnamed.SetFactName(nullptr), "(|()|)");
    EXPECT_STREQ(unnamed.SetFactName("chat"), "chat(|()|)");
    CUsersGroup group;
    group.SetGrpName("Panel");
    EXPECT_STREQ(group.SetFactName(nullptr), "(|(Panel)|)");
    EXPECT_STREQ(group.SetFactName("chat"), "chat(|(Panel)|)");
}

TEST(CUsersGroup, SetGroupReadsAWholeRoleGroupOrASeparator) {
    CUsersGroup group;
    group.AddAMember(1);
    ASSERT_EQ(group.SetGroup(kRoleGroupBytes.data(), kRoleGroupBytes.size()), 1);
    EXPECT_EQ(group.GetGroupId(), 8u);
    EXPECT_STREQ(group.GetGrpName(), "All Attendees");
    EXPECT_STREQ(group.GetGrpLabel(), "att");
    ASSERT_EQ(group.GetMemberCount(), 2);  // the earlier member is gone
    EXPECT_EQ(group.GetMember(1), 9u);

    const Bytes separator = {0x00, 0x00, 0x00, 0x02};
    EXPECT_EQ(group.SetGroup(separator.data(), separator.size()), 1);
    EXPECT_EQ(group.GetGroupType(), 2u);
    EXPECT_EQ(group.GetGrpName(), nullptr);
}

TEST(CUsersGroup, SetGroupRefusesIncompleteOrLyingData) {
    Bytes zeroCount(kRoleGroupBytes.begin(), kRoleGroupBytes.begin() + kCountOffset);
    zeroCount.insert(zeroCount.end(), {0, 0, 0, 0});
    Bytes lyingCount = kRoleGroupBytes;
    lyingCount[kCountOffset + 3] = 3;
    Bytes hugeCount = kRoleGroupBytes;
    hugeCount[kCountOffset] = 0xFF;
    Bytes noLabel(kRoleGroupBytes.begin(), kRoleGroupBytes.begin() + 26);
    noLabel.insert(noLabel.end(), {0, 0, 0, 0, 0, 0, 0, 1, 0, 0, 0, 7});
    const Bytes noName = {0, 0, 0, 1, 0, 0, 0, 8, 0, 0, 0, 0};
    std::vector<std::pair<const char*, Bytes>> cases = {{"member count 0", zeroCount},
                                                        {"count above the members", lyingCount},
                                                        {"count beyond any size", hugeCount},
                                                        {"null label", noLabel},
                                                        {"null name", noName}};
    // Every cut of the complete group ends too early.
    for (std::size_t size = 1; size < kRoleGroupBytes.size(); ++size)
        cases.push_back(
            {"truncated", Bytes(kRoleGroupBytes.begin(), kRoleGroupBytes.begin() + size)});
    for (const auto& [what, data] : cases) {
        SCOPED_TRACE(std::string(what) + ", size " + std::to_string(data.size()));
        // The stream may read only the given bytes: a copy on the heap lets a sanitizer see
        // any read past them.
        std::unique_ptr<unsigned char[]> exact(new unsigned char[data.size()]);
        std::memcpy(exact.get(), data.data(), data.size());
        CUsersGroup group;
        group.SetGrpName("old");
        EXPECT_EQ(group.SetGroup(exact.get(), static_cast<std::uint32_t>(data.size())), 0);
        EXPECT_EQ(group.GetGrpName(), nullptr);
        EXPECT_EQ(group.GetGrpLabel(), nullptr);
        EXPECT_EQ(group.GetMemberCount(), 0);
    }
    CUsersGroup group;
    EXPECT_EQ(group.SetGroup(nullptr, 4), 0);
    EXPECT_EQ(group.SetGroup(kRoleGroupBytes.data(), 0), 0);
}

TEST(CUsersGroup, FlagSchemesStoreWholeOrUnpacked) {
    // Each case: value, packed; the flags, the three bits and whether the group is listed.
    const std::tuple<std::uint32_t, bool, std::uint32_t, std::uint32_t, std::uint32_t,
                     std::uint32_t, bool>
        cases[] = {
            {0x1F, false, 0x1F, 0, 1, 0, true},  // first scheme: whole value, bits untouched
            {0x0B, true, 1, 1, 0, 1, false},
            {0x14, true, 0, 0, 1, 0, true},
        };
    for (const auto& [value, packed, flags, bit1, bit2, bit3, listed] : cases) {
        SCOPED_TRACE(value);
        CUsersGroup group;
        group.SetFlags(value, packed);
        EXPECT_EQ(group.GetFlags(), flags);
        EXPECT_EQ(group.GetFlagBit1(), bit1);
        EXPECT_EQ(group.GetFlagBit2(), bit2);
        EXPECT_EQ(group.GetFlagBit3(), bit3);
        EXPECT_EQ(group.IsListed(), listed);
    }
}

TEST(CUsersGroup, CacheRecordHoldsSixtyFourCharactersUntilDeleted) {
    CUsersGroup group;
    group.SetCacheName(std::string(70, 'c').c_str());
    group.SetCacheHandle(42);
    EXPECT_EQ(std::string(group.GetCacheName()), std::string(64, 'c'));
    EXPECT_EQ(group.DeleteMembers(), 1);
    group.SetCacheHandle(7);
    EXPECT_EQ(group.GetCacheName(), nullptr);
    EXPECT_EQ(group.GetCacheHandle(), 0u);
}

TEST(CUsersGroupList, GroupInfoLookUpsTakeTheFirstGroupOrTheFirstNamelessOne) {
    // The first of a type and id is the only one a named look-up compares; GetGroupInfo2 without
    // a name prefers a nameless group, else takes the last.
    CUsersGroupList list;
    const std::pair<std::uint32_t, const char*> groups[] = {
        {8, "All Attendees"}, {8, "Second"}, {1, "Host"}, {1, nullptr},
        {1, nullptr},         {4, nullptr},  {4, "Panel"}};
    for (const auto& g : groups)
        Append(list, MakeGroup(1, g.first, g.second));
    // Each case: GetGroupInfo2 (else GetGroupInfo), type, id, name; the index found, -1 for none.
    const std::tuple<bool, std::uint32_t, std::uint32_t, const char*, std::int32_t> cases[] = {
        {false, 1, 8, "all ATTENDEES", 0}, {false, 1, 8, nullptr, 0},
        {false, 1, 8, "Second", -1},       {false, 1, 4, "Panel", -1},
        {false, 3, 8, nullptr, -1},        {true, 1, 8, nullptr, 1},
        {true, 1, 1, nullptr, 3},          {true, 1, 8, "ALL attendees", 0},
        {true, 1, 8, "Second", -1},        {true, 2, 0, nullptr, -1},
    };
    for (const auto& [second, type, id, name, found] : cases) {
        SCOPED_TRACE(std::to_string(second) + "/" + std::to_string(id) + "/" + (name ? name : "-"));
        std::int32_t position = 99;
        const CUsersGroup* group = second ? list.GetGroupInfo2(type, id, name, &position)
                                          : list.GetGroupInfo(type, id, name, &position);
        EXPECT_EQ(group, found < 0 ? nullptr : list.GetGroupByIndex(found));
        EXPECT_EQ(position, found);
    }
}

TEST(CUsersGroupList, InsertGroupAppendsForPositionsOutsideTheList) {
    CUsersGroupList list;
    EXPECT_EQ(list.InsertGroup(0, nullptr), -1);
    EXPECT_EQ(list.InsertGroup(5, MakeGroup(1, 1, "a")), 1);
    EXPECT_EQ(list.InsertGroup(0, MakeGroup(1, 2, "b")), 1);
    EXPECT_EQ(list.InsertGroup(0xFFFFFFFFu, MakeGroup(1, 3, "c")), 1);
    EXPECT_EQ(list.InsertGroup(1, MakeGroup(1, 4, "d")), 1);
    EXPECT_EQ(Ids(list), (std::vector<std::uint32_t>{2, 4, 1, 3}));
}

TEST(CUsersGroupList, InsertGroup2FollowsTheKeyedGroupOrGoesToTheFront) {
    CUsersGroupList list;
    EXPECT_EQ(list.InsertGroup2(0, nullptr), -1);
    ASSERT_EQ(list.InsertGroup2(5, MakeGroup(1, 1, "a")), 1);  // nobody has 5: front
    ASSERT_EQ(list.InsertGroup2(1, MakeGroup(1, 2, "b")), 1);  // after sequence 1
    ASSERT_EQ(list.InsertGroup2(1, MakeGroup(1, 3, "c")), 1);  // after sequence 1 again
    ASSERT_EQ(list.InsertGroup2(9, MakeGroup(1, 4, "d")), 1);  // unknown: front
    EXPECT_EQ(Ids(list), (std::vector<std::uint32_t>{4, 1, 3, 2}));
    EXPECT_EQ(list.GetInsertIndex(3), 3);
    EXPECT_EQ(list.GetInsertIndex(7), -1);
}

TEST(CUsersGroupList, RowsCountAHeaderAndOneRowPerMember) {
    CUsersGroupList list;
    EXPECT_EQ(list.GetInsertPosition(3), -1);
    Append(list, MakeGroup(3, 20, "a", 2));
    CUsersGroup* hidden = Append(list, MakeGroup(3, 21, "b", 0));
    Append(list, MakeGroup(3, 22, "c", 1));
    list.ReArrangeGroupIndex();
    EXPECT_EQ(list.GetGroupByIndex(0)->GetFirstRow(), 0);
    EXPECT_EQ(list.GetGroupByIndex(1)->GetFirstRow(), 3);
    EXPECT_EQ(list.GetGroupByIndex(2)->GetFirstRow(), 4);
    EXPECT_EQ(list.GetInsertPosition(2), 4);
    EXPECT_EQ(list.GetInsertPosition(10), 6);
    // Group 22's member is the row below its header.
    EXPECT_TRUE(list.IsUserInSameSel(1220, 5));
    EXPECT_FALSE(list.IsUserInSameSel(1220, 4));
    EXPECT_TRUE(list.IsUserInSameSel(1201, 2));

    hidden->SetFlags(0x00, true);  // not listed
    hidden->AddAMember(77);
    list.ReArrangeGroupIndex2();
    EXPECT_EQ(list.GetGroupByIndex(2)->GetFirstRow(), 3);
    EXPECT_EQ(hidden->GetFirstRow(), 3);  // left as it was
}

TEST(CUsersGroupList, ModifyAndDeleteWorkById) {
    CUsersGroupList list;
    Append(list, MakeGroup(1, 1, "Host"));
    Append(list, MakeGroup(3, 30, "ids", 2));
    Append(list, MakeGroup(1, 4, nullptr));
    EXPECT_EQ(list.FindGroupFromGrpNames("host"), nullptr);  // names match exactly
    EXPECT_EQ(list.FindGroupFromSpecificNodeId(1301), list.GetGroupByIndex(1));

    std::unique_ptr<CUsersGroup> replacement = MakeGroup(1, 30, "renamed", 1);
    EXPECT_EQ(list.ModifyGroup(*replacement), 1);
    replacement->SetGrpName("changed afterwards");  // the list holds its own copy
    EXPECT_STREQ(list.GetGroupByIndex(1)->GetGrpName(), "renamed");
    EXPECT_EQ(list.GetGroupByIndex(1)->GetMemberCount(), 1);
    EXPECT_EQ(list.ModifyGroup(*MakeGroup(1, 99, "x")), 0);

    EXPECT_EQ(list.AddGroup(*MakeGroup(1, 8, "All Attendees")), 1);
    EXPECT_EQ(list.DeleteGroup(*MakeGroup(0, 30, nullptr)), 1);
    EXPECT_EQ(list.DeleteGroupbyIndex(0), 1);
    EXPECT_EQ(list.DeleteGroupbyIndex(2), 0);
    EXPECT_EQ(Ids(list), (std::vector<std::uint32_t>{4, 8}));
}
