#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "kyutil/ky_vector.h"
#include "tests/kyutil/debug_output_capture.h"

namespace {

// The vector never follows its pointers, so item n is stored as the address n + 1.
void* Item(int n) {
    return reinterpret_cast<void*>(static_cast<intptr_t>(n) + 1);
}

std::vector<int> Numbers(const CKyVector& v) {
    std::vector<int> numbers;
    for (int32_t i = 0; i < v.GetCount(); ++i)
        numbers.push_back(static_cast<int>(reinterpret_cast<intptr_t>(v[i])) - 1);
    return numbers;
}

CKyVector Of(const std::vector<int>& numbers) {
    CKyVector v;
    for (int n : numbers)
        v.Add(Item(n));
    return v;
}

}  // namespace

TEST(KyVector, AddRemoveAndLookupUseTheFirstOccurrenceAndMoveTheTail) {
    CKyVector v = Of({1, 2, 1});
    EXPECT_EQ(0, v.Add(Item(2), true));
    EXPECT_EQ(1, v.Add(Item(3), true));
    EXPECT_EQ(1, v.GetIndex(Item(2)));
    EXPECT_EQ(-1, v.GetIndex(Item(9)));
    EXPECT_EQ(nullptr, v[-1]);
    EXPECT_EQ(nullptr, v[v.GetCount()]);
    EXPECT_EQ(1, v.Remove(Item(1)));
    EXPECT_EQ(0, v.Remove(Item(9)));
    EXPECT_EQ(1, v.RemoveAt(1));
    EXPECT_EQ(0, v.RemoveAt(2));
    EXPECT_EQ(0, v.RemoveAt(-1));
    EXPECT_EQ((std::vector<int>{2, 3}), Numbers(v));
    v.RemoveAll();
    EXPECT_EQ(0, v.GetCount());
    EXPECT_EQ(nullptr, v.GetData());
}

TEST(KyVector, InsertAtMovesTheTailUpOrRefusesAndAFullVectorGrowsByThirtyTwoSlots) {
    CKyVector v = Of({1, 2});
    EXPECT_EQ(1, v.InsertAt(0, Item(0)));
    EXPECT_EQ(1, v.InsertAt(2, Item(9)));
    EXPECT_EQ(1, v.InsertAt(4, Item(3)));
    EXPECT_EQ((std::vector<int>{0, 1, 9, 2, 3}), Numbers(v));

    // Thirty-two slots at a time, whether an add or an insert finds the vector full.
    CKyVector full, added;
    for (int i = 0; i < 32; ++i) {
        ASSERT_EQ(1, full.Add(Item(i + 1)));
        added.Add(Item(i));
    }
    EXPECT_EQ(32, full.GetCapacity());
    EXPECT_EQ(1, full.InsertAt(0, Item(0)));
    EXPECT_EQ(1, added.Add(Item(32)));
    for (const CKyVector* grown : {&full, &added}) {
        EXPECT_EQ(64, grown->GetCapacity());
        EXPECT_EQ(Numbers(*grown),
                  Numbers(Of({0,  1,  2,  3,  4,  5,  6,  7,  8,  9,  10, 11, 12, 13, 14, 15, 16,
                              17, 18, 19, 20, 21, 22, 23, 24, 25, 26, 27, 28, 29, 30, 31, 32})));
    }

    // Indexes out of range are refused and reported.
    CKyVector two = Of({1, 2});
    DebugOutputCapture capture;
    EXPECT_EQ(0, two.InsertAt(-1, Item(9)));
    EXPECT_EQ(0, two.InsertAt(3, Item(9)));
    EXPECT_EQ(0, two.SetAt(-1, Item(9)));
    EXPECT_EQ(0, two.SetAt(2, Item(9)));
    EXPECT_EQ((std::vector<int>{1, 2}), Numbers(two));
    const std::string insert =
        "Assert -- nIndex >= 0 && nIndex <= m_nUsed in InsertAt of newutil/macutil\n";
    const std::string set =
        "Assert -- nIndex >= 0 && nIndex < m_nUsed in SetAt of newutil/macutil\n";
    EXPECT_EQ((std::vector<std::string>{insert, insert, set, set}), capture.Texts());
    EXPECT_EQ(1, two.SetAt(1, Item(9)));
    EXPECT_EQ((std::vector<int>{1, 9}), Numbers(two));
}

TEST(KyVector, CopiesHoldTheSamePointersInTheirOwnArrays) {
    const CKyVector original = Of({1, 2, 3});
    CKyVector assigned = Of({7, 8, 9, 9});
    assigned = original;
    CKyVector& alias = assigned;
    assigned = alias;
    EXPECT_EQ((std::vector<int>{1, 2, 3}), Numbers(assigned));
    EXPECT_NE(original.GetData(), assigned.GetData());
    EXPECT_EQ(Numbers(original), Numbers(*original.Clone()));
}
