#include "platform/BList.h"

#include <gtest/gtest.h>

#include <vector>

namespace {

void* P(intptr_t i)
{
    return reinterpret_cast<void*>(i);
}

std::vector<intptr_t> Contents(const BList& list)
{
    std::vector<intptr_t> out;
    for (int32_t i = 0; i < list.CountItems(); i++)
        out.push_back(reinterpret_cast<intptr_t>(list.ItemAt(i)));
    return out;
}

} // namespace

TEST(BList, StaysSmall)
{
    EXPECT_EQ(sizeof(BList), 2 * sizeof(void*) + 8);
}

TEST(BList, EmptyListLookupsGiveNull)
{
    const BList list(5);
    EXPECT_EQ(list.CountItems(), 0);
    EXPECT_TRUE(list.IsEmpty());
    EXPECT_EQ(list.ItemAt(0), nullptr);
    EXPECT_EQ(list.ItemAt(-1), nullptr);
    EXPECT_EQ(list.FirstItem(), nullptr);
    EXPECT_EQ(list.LastItem(), nullptr);
    EXPECT_EQ(list.IndexOf(P(1)), -1);
}

TEST(BList, AppendsInsertsAndRemovesAcrossTheSingleItemBoundary)
{
    BList list(2);
    EXPECT_TRUE(list.AddItem(P(10)));
    EXPECT_EQ(Contents(list), (std::vector<intptr_t> { 10 }));
    EXPECT_EQ(list.Items()[0], P(10));
    EXPECT_TRUE(list.AddItem(P(30)));
    EXPECT_TRUE(list.AddItem(P(20), 1));
    EXPECT_TRUE(list.AddItem(P(5), 0));
    EXPECT_FALSE(list.AddItem(P(99), 9));
    EXPECT_EQ(Contents(list), (std::vector<intptr_t> { 5, 10, 20, 30 }));
    EXPECT_EQ(list.FirstItem(), P(5));
    EXPECT_EQ(list.LastItem(), P(30));
    EXPECT_EQ(list.IndexOf(P(20)), 2);

    EXPECT_EQ(list.RemoveItem(int32_t(0)), P(5));
    EXPECT_TRUE(list.RemoveItem(P(20)));
    EXPECT_FALSE(list.RemoveItem(P(20)));
    EXPECT_EQ(list.RemoveItem(int32_t(7)), nullptr);
    EXPECT_EQ(Contents(list), (std::vector<intptr_t> { 10, 30 }));
    EXPECT_EQ(list.RemoveItem(int32_t(1)), P(30));
    EXPECT_EQ(Contents(list), (std::vector<intptr_t> { 10 }));
    EXPECT_EQ(list.RemoveItem(int32_t(0)), P(10));
    EXPECT_TRUE(list.IsEmpty());
}

TEST(BList, GrowsInBlocksWithDoublingBlockCounts)
{
    BList list(5000);
    for (intptr_t i = 0; i < 100000; i++)
        list.AddItem(P(i));
    EXPECT_EQ(list.CountItems(), 100000);
    EXPECT_EQ(list.Capacity() % 5000, 0);
    EXPECT_GE(list.Capacity(), 100000);
    EXPECT_LT(list.Capacity(), 200000);
    for (intptr_t i = 0; i < 100000; i += 997)
        ASSERT_EQ(list.ItemAt(int32_t(i)), P(i));
}

TEST(BList, CopiesAndAppendsLists)
{
    BList a(3);
    for (intptr_t i = 1; i <= 4; i++)
        a.AddItem(P(i));
    BList b(a);
    EXPECT_EQ(Contents(b), Contents(a));
    b.AddList(&b);
    EXPECT_EQ(Contents(b), (std::vector<intptr_t> { 1, 2, 3, 4, 1, 2, 3, 4 }));
    BList c;
    c.AddItem(P(9));
    c = a;
    EXPECT_EQ(Contents(c), Contents(a));
    c.MakeEmpty();
    EXPECT_TRUE(c.IsEmpty());
    EXPECT_EQ(Contents(a).size(), 4u);
}

TEST(BList, ReplacesSwapsAndSorts)
{
    BList list;
    for (intptr_t i : { 4, 1, 3, 2 })
        list.AddItem(P(i));
    EXPECT_TRUE(list.SwapItems(0, 3));
    EXPECT_TRUE(list.ReplaceItem(1, P(7)));
    EXPECT_FALSE(list.ReplaceItem(4, P(7)));
    EXPECT_EQ(Contents(list), (std::vector<intptr_t> { 2, 7, 3, 4 }));
    list.SortItems([](const void* a, const void* b) {
        const auto x = *static_cast<const intptr_t*>(a), y = *static_cast<const intptr_t*>(b);
        return x < y ? -1 : x > y ? 1 : 0;
    });
    EXPECT_EQ(Contents(list), (std::vector<intptr_t> { 2, 3, 4, 7 }));
}
