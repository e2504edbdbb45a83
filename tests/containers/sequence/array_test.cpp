#include "../testobject.h"

#include "containers/sequence/cmarray.h"
#include "containers/sequence/cmorderedarray.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <vector>

namespace
{
template <class Array>
std::vector<int> sizesWhileGrowing(Array& array, int count)
{
    std::vector<int> sizes;
    for (int i = 0; i < count; i++)
    {
        array.add(new Item(i));
        if (sizes.empty() || sizes.back() != array.size())
            sizes.push_back(array.size());
    }
    return sizes;
}

CmArray& addItems(CmArray& array, const char* marks, std::initializer_list<int> ranks)
{
    array.takeElements();
    for (int rank : ranks)
        array.add(new Item(rank, *marks++));
    return array;
}
} // namespace

TEST(CmArray, GrowsByItsDelta)
{
    CmArray fixed(0, 0), doubling(0, -1), stepping(0, 10);
    Item item;
    EXPECT_FALSE(fixed.add(&item));
    doubling.takeElements();
    stepping.takeElements();
    EXPECT_EQ(sizesWhileGrowing(doubling, 21), (std::vector<int>{10, 20, 40}));
    EXPECT_EQ(sizesWhileGrowing(stepping, 21), (std::vector<int>{10, 20, 30}));

    CmArray twoPlaces(2, 0);
    EXPECT_TRUE(twoPlaces.add(&item));
    EXPECT_TRUE(twoPlaces.insertAt(0, &item));
    EXPECT_FALSE(twoPlaces.add(&item));
    EXPECT_FALSE(twoPlaces.insertAt(0, &item));
    EXPECT_EQ(item.getRefCount(), 1u);
}

TEST(CmArray, KeepsItsElementsThroughManySteps)
{
    CmArray array(0, 3);
    array.takeElements();
    for (int rank = 0; rank < 1000; rank++)
    {
        ASSERT_TRUE(array.add(new Item(rank)));
        ASSERT_EQ(array.size(), rank / 3 * 3 + 3);
    }
    for (const int size : {999, 501, 500, 17, 16, 1})
    {
        ASSERT_TRUE(array.resize(size));
        ASSERT_EQ(rankOf(array.at(size - 1)), size - 1);
        ASSERT_EQ(array.total(), size);
    }
    EXPECT_TRUE(array.resize(40));
    for (int rank = 1; rank < 41; rank++)
        ASSERT_TRUE(array.add(new Item(rank)));
    EXPECT_EQ(rankOf(array.at(40)), 40);
}

TEST(CmArray, RemovesTheVeryObjectOnly)
{
    CmArray array;
    addItems(array, "ab", {1, 1});
    Item equal(1);
    EXPECT_FALSE(array.remove(&equal));
    EXPECT_TRUE(array.remove(array.at(1)));
    EXPECT_EQ(marksOf(array), "a");
    EXPECT_EQ(array.index(&equal), 0);
    EXPECT_EQ(array.indexAbs(&equal), -1);
    EXPECT_EQ(array.size(), 10) << "the capacity stays";
    array.removeAll();
    EXPECT_EQ(array.size(), 10);
}

TEST(CmArray, InsertsReplacesAndSwaps)
{
    CmArray array;
    addItems(array, "abc", {1, 2, 3});
    EXPECT_TRUE(array.insertAt(3, new Item(4, 'd')));
    EXPECT_TRUE(array.insertAt(1, new Item(5, 'e')));
    Item item;
    EXPECT_FALSE(array.insertAt(-1, &item));
    EXPECT_FALSE(array.insertAt(6, &item));
    EXPECT_EQ(marksOf(array), "aebcd");
    EXPECT_TRUE(array.swap(0, 4));
    EXPECT_FALSE(array.swap(0, 5));
    EXPECT_TRUE(array.replaceAt(1, new Item(6, 'f')));
    EXPECT_TRUE(array.replaceAt(1, array.at(1))) << "must not release what stays";
    EXPECT_FALSE(array.replaceAt(5, &item));
    EXPECT_EQ(marksOf(array), "dfbca");
    const auto it = iterate(array);
    *it += 2;
    EXPECT_EQ(array.index(*it), 2);
    *it += 9;
    EXPECT_EQ(array.index(*it), -1);
    EXPECT_EQ(Item::alive, 6);
}

TEST(CmArray, ResizeDropsTheSurplus)
{
    CmArray array;
    addItems(array, "abc", {1, 2, 3});
    EXPECT_TRUE(array.resize(2));
    EXPECT_EQ(marksOf(array), "ab");
    EXPECT_EQ(array.size(), 2);
    EXPECT_EQ(Item::alive, 2);
    EXPECT_TRUE(array.resize(0));
    EXPECT_TRUE(array.isEmpty());
    EXPECT_EQ(array.size(), 0);
    EXPECT_TRUE(array.add(new Item(1)));
}

TEST(CmArray, PlacesInASortedStretch)
{
    CmArray array;
    addItems(array, "abcde", {10, 20, 20, 30, 40});
    const auto placeOf = [&array](int rank, int from, int to)
    {
        const Item item(rank);
        return array.shouldGo(&item, from, to);
    };
    EXPECT_EQ(array.shouldGo(nullptr, 0, -1), -1);
    EXPECT_EQ(placeOf(20, 0, -1), 3) << "behind its equals";
    EXPECT_EQ(placeOf(25, 0, -1), 3);
    EXPECT_EQ(placeOf(5, 0, -1), 0);
    EXPECT_EQ(placeOf(10, 0, -1), 0) << "the first one's equal goes in front";
    EXPECT_EQ(placeOf(40, 0, -1), 5);
    EXPECT_EQ(placeOf(35, 0, 3), 5) << "above the stretch is the end of the array";
    EXPECT_EQ(placeOf(15, 1, 3), 1);
    EXPECT_EQ(placeOf(25, 0, 99), 3);
    EXPECT_EQ(placeOf(25, 0, 0), 3) << "an end below 1 is the last element";
    EXPECT_EQ(CmArray().shouldGo(array.at(0), 0, -1), 0);
}

TEST(CmArray, AddsSorted)
{
    CmArray array;
    array.takeElements();
    for (int rank : {5, 1, 4, 1, 3, 5, 2})
        EXPECT_TRUE(array.addSorted(new Item(rank)));
    EXPECT_EQ(ranksOf(array), "1 1 2 3 4 5 5");
    EXPECT_FALSE(array.addSorted(nullptr));
}

TEST(CmArray, MergesSortedArrays)
{
    CmArray array(0, 1), other;
    addItems(array, "abc", {1, 3, 5});
    addItems(other, "ABCD", {0, 3, 5, 9});
    EXPECT_TRUE(array.mergeSorted(other));
    EXPECT_EQ(marksOf(array), "AabBcCD");
    EXPECT_EQ(Item::alive, 11) << "mode 1 holds copies";
    EXPECT_TRUE(array.mergeSorted(array));
    EXPECT_EQ(ranksOf(array), "0 0 1 1 3 3 3 3 5 5 5 5 9 9");
    CmArray fixed(1, 0);
    EXPECT_FALSE(fixed.mergeSorted(other));
    EXPECT_TRUE(fixed.isEmpty());
}

TEST(CmArray, CountsAReferenceForEveryWayIntoMode2)
{
    Item one(1), two(2), three(3);
    CmArray array, other;
    array.retainElements();
    array.add(&one);
    EXPECT_TRUE(array.replaceAt(0, &two));
    EXPECT_EQ(one.getRefCount(), 1u);
    EXPECT_EQ(two.getRefCount(), 2u);
    other.add(&one);
    other.add(&three);
    EXPECT_TRUE(array.mergeSorted(other));
    EXPECT_EQ(ranksOf(array), "1 2 3");
    for (const Item* item : {&one, &two, &three})
        EXPECT_EQ(item->getRefCount(), 2u) << item->rank;
}

TEST(CmArray, KeepsNothingOfWhatItRefuses)
{
    CmArray source, fixed(1, 0);
    addItems(source, "abc", {1, 2, 3});
    fixed.takeElements();
    EXPECT_FALSE(fixed.addAllFrom(&source));
    EXPECT_EQ(Item::alive, 4) << "copies that found no place must go";
    fixed.removeAll();
    EXPECT_FALSE(fixed.takeAllFrom(&source, true));
    EXPECT_EQ(source.at(0)->getRefCount(), 2u);
    EXPECT_EQ(source.at(1)->getRefCount(), 1u);
    EXPECT_EQ(fixed.getOwnership(), 1);
}

TEST(CmArray, SortsByCompare)
{
    std::mt19937 random(1);
    CmArray array;
    array.takeElements();
    std::vector<int> ranks;
    for (int i = 0; i < 500; i++)
    {
        ranks.push_back(static_cast<int>(random() % 100));
        array.add(new Item(ranks.back()));
    }
    std::sort(ranks.begin(), ranks.end());
    array.quickSort();
    for (int i = 0; i < 500; i++)
        ASSERT_EQ(rankOf(array.at(i)), ranks[static_cast<size_t>(i)]);
}

TEST(CmOrderedArray, KeepsEqualElementsInOrderOfInsertion)
{
    CmOrderedArray array(0, 1);
    array.takeElements();
    const char* marks = "abcdefg";
    for (int rank : {2, 1, 2, 3, 1, 2, 3})
        EXPECT_TRUE(array.add(new Item(rank, *marks++)));
    EXPECT_EQ(marksOf(array), "beacfdg");
    const Item two(2), nine(9);
    EXPECT_EQ(array.index(&two), 2);
    EXPECT_EQ(array.index(&nine), -1);
    EXPECT_EQ(array.shouldGo(&two), -1) << "a full array has no place";
    array.resize(20);
    EXPECT_EQ(array.shouldGo(&two), 5);
    EXPECT_TRUE(array.remove(array.at(4))) << "an equal one is as good";
    EXPECT_EQ(marksOf(array), "becfdg");
    EXPECT_TRUE(array.removeAbs(array.at(3)));
    EXPECT_EQ(marksOf(array), "becdg");
}

TEST(CmOrderedArray, GrowsAsTheArrayDoesAndRefusesWhenFull)
{
    CmOrderedArray fixed(1, 0), doubling(0, -1);
    doubling.takeElements();
    EXPECT_EQ(sizesWhileGrowing(doubling, 21), (std::vector<int>{10, 20, 40}));
    Item item;
    EXPECT_TRUE(fixed.add(&item));
    EXPECT_FALSE(fixed.add(&item));
}

namespace
{
/// All sort alike, none is equal to another.
class SameRank : public CmObject
{
    DECLARE_COPYABLE(SameRank, CmObject)

    using CmObject::compare;
    int compare(const CmObject*) const override { return 0; }
};
} // namespace

TEST(CmOrderedArray, LooksAtRankFromThreeElementsOn)
{
    CmOrderedArray array;
    SameRank elements[3], other;
    array.add(&elements[0]);
    array.add(&elements[1]);
    EXPECT_EQ(array.index(&other), -1) << "up to two are compared by isEqual";
    EXPECT_EQ(array.index(&elements[1]), 1);
    array.add(&elements[2]);
    EXPECT_EQ(array.index(&other), 0);
    EXPECT_EQ(array.index(&elements[1]), 0);
    EXPECT_EQ(array.indexAbs(&elements[1]), 1);
}

TEST(CmOrderedArray, SortsAnewAfterChanges)
{
    CmOrderedArray array;
    array.takeElements();
    for (int rank : {1, 2, 3})
        array.add(new Item(rank));
    static_cast<Item*>(array.at(0))->rank = 9;
    array.resort();
    EXPECT_EQ(ranksOf(array), "2 3 9");
}
