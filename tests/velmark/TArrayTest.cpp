// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/TArray.h"
#include "velmark/Counted.h"
#include "velmark/FObject.h"

#include <gtest/gtest.h>

#include <vector>

using namespace Velmark;

TEST(TArray, HoldsObjectsInTheOrderInWhichTheyCameWithoutCountingThem)
{
    const auto first = makeCounted<FObject>();
    const auto second = makeCounted<FObject>();
    TArray<FObject*> array;
    EXPECT_TRUE(array.isEmpty());

    array.add(first.get());
    array.add(second.get());

    EXPECT_EQ(array.count(), 2);
    EXPECT_FALSE(array.isEmpty());
    EXPECT_EQ(array.at(0), first.get());
    EXPECT_EQ(array.at(1), second.get());
    EXPECT_EQ(first->refCount(), 1);
}

TEST(TArray, HasNothingAtAnIndexThatIsntThere)
{
    const auto object = makeCounted<FObject>();
    TArray<FObject*> array;
    array.add(object.get());

    EXPECT_EQ(array.at(-1), nullptr);
    EXPECT_EQ(array.at(1), nullptr);
}

TEST(TArray, RemovesTheFirstThatIsEqualAndClosesTheGap)
{
    TArray<int> array;
    for (const int element : {5, 6, 5, 7})
        array.add(element);

    EXPECT_TRUE(array.remove(5));
    EXPECT_FALSE(array.remove(8));

    ASSERT_EQ(array.count(), 3);
    EXPECT_EQ(array.at(0), 6);
    EXPECT_EQ(array.at(1), 5);
    EXPECT_EQ(array.at(2), 7);
}

TEST(TArray, GivesTheLastAndRemovesIt)
{
    TArray<int> array;
    array.add(5);
    array.add(6);

    EXPECT_EQ(array.removeLast(), 6);
    EXPECT_EQ(array.removeLast(), 5);
    EXPECT_EQ(array.removeLast(), 0);
    EXPECT_EQ(array.count(), 0);
}

TEST(TArray, GrowsByDoubling)
{
    TArray<int> array(3);
    EXPECT_EQ(array.capacity(), 3);

    std::vector<int32> capacities;
    for (int element = 0; element < 13; ++element) {
        array.add(element);
        capacities.push_back(array.capacity());
    }

    EXPECT_EQ(capacities, (std::vector<int32>{3, 3, 3, 6, 6, 6, 12, 12, 12, 12, 12, 12, 24}));
}

TEST(TArray, GrowsFromNothing)
{
    TArray<int> array;

    std::vector<int32> capacities;
    for (int element = 0; element < 5; ++element) {
        array.add(element);
        capacities.push_back(array.capacity());
    }

    EXPECT_EQ(capacities, (std::vector<int32>{1, 2, 4, 4, 8}));
}

TEST(TArray, IsEmptyAfterAllWasRemoved)
{
    TArray<int> array;
    array.add(5);

    array.removeAll();

    EXPECT_TRUE(array.isEmpty());
    EXPECT_EQ(array.at(0), 0);
}

TEST(TIterator, WalksOverTheArrayAndOverWhatIsAddedMeanwhile)
{
    TArray<int> array;
    array.add(5);
    array.add(6);

    auto iterator = array.iterator();
    EXPECT_FALSE(iterator.isDone());
    EXPECT_EQ(iterator.next(), 5);
    EXPECT_EQ(iterator.next(), 6);
    EXPECT_TRUE(iterator.isDone());
    array.add(7);
    EXPECT_FALSE(iterator.isDone());
    EXPECT_EQ(iterator.next(), 7);

    EXPECT_TRUE(iterator.isDone());
    EXPECT_EQ(iterator.next(), 0);
}
