#include "../testobject.h"

#include "containers/keyed/cmbtree.h"
#include "containers/keyed/cmhashtable.h"
#include "foundation/text/cmstring.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <vector>

namespace
{
void fill(CmContainer& container, int count)
{
    container.takeElements();
    for (int rank = 0; rank < count; rank++)
        container.add(new Item(rank));
}

unsigned lastBucket(const CmObject*, unsigned size)
{
    return size - 1;
}

/// Opens the tree's structure to the test.
class OpenTree : public CmBTree
{
    DECLARE_COPYABLE(OpenTree, CmBTree)

    explicit OpenTree(int order) : CmBTree(order) { takeElements(); }

    CmBTreeNode* root()
    {
        CmBTreeNode* node = isEmpty() ? nullptr : lookupNode(at(0));
        while (node && node->parent)
            node = node->parent;
        return node;
    }
    /// Checks a node and all below: its number of keys, its links, and that all leaves are on one level. Gives the
    /// number of keys.
    int check(const CmBTreeNode* node, int level)
    {
        const int minimum = getOrder() % 2 == 0 ? getOrder() / 2 - 1 : (getOrder() - 1) / 2;
        EXPECT_LE(node->count, getOrder() - 1);
        EXPECT_GE(node->count, node->parent ? minimum : 1);
        EXPECT_EQ(node->isLeaf(), level == height());
        int keys = node->count;
        for (int i = 0; i <= getOrder(); i++)
        {
            const CmBTreeNode* child = node->children[i];
            EXPECT_EQ(child != nullptr, !node->isLeaf() && i <= node->count);
            if (!child)
                continue;
            EXPECT_EQ(child->parent, node);
            keys += check(child, level + 1);
        }
        return keys;
    }
    void expectSound()
    {
        if (isEmpty())
        {
            EXPECT_EQ(height(), 0);
            return;
        }
        EXPECT_EQ(check(root(), 1), total());
    }
};
} // namespace

TEST(CmHashTable, GrowsTenfoldOnlyWhenAsked)
{
    CmHashTable growing, fixed;
    growing.setAutoResize(true);
    std::vector<int> sizes;
    growing.takeElements();
    for (int rank = 0; rank < 201; rank++)
    {
        growing.add(new Item(rank));
        if (rank == 19 || rank == 20 || rank == 199 || rank == 200)
            sizes.push_back(growing.size());
    }
    EXPECT_EQ(sizes, (std::vector<int>{10, 100, 100, 1000}));
    EXPECT_EQ(growing.total(), 201);
    for (int rank = 0; rank < 201; rank++)
        EXPECT_TRUE(growing.contains(std::make_unique<Item>(rank).get()));

    fill(fixed, 1000);
    EXPECT_EQ(fixed.size(), 10);
    const Item last(999);
    EXPECT_EQ(rankOf(fixed.lookup(&last)), 999);
}

TEST(CmHashTable, IteratesByBucketsAndChains)
{
    CmHashTable table(3);
    table.takeElements();
    for (int rank : {5, 3, 1, 0, 2})
        table.add(new Item(rank));
    EXPECT_EQ(ranksOf(table), "3 0 1 5 2");
    EXPECT_EQ(ranksBackwards(table), "2 5 1 0 3");
    const CmObject* first = table.at(0);
    EXPECT_TRUE(table.resize(2));
    EXPECT_EQ(ranksOf(table), "0 2 3 1 5") << "reinserted in the old order of iteration";
    EXPECT_EQ(first->getRefCount(), 1u);
    EXPECT_FALSE(table.resize(0));
    EXPECT_EQ(table.total(), 5);
    EXPECT_TRUE(table.removeAt(1));
    EXPECT_EQ(ranksOf(table), "0 3 1 5");
    table.removeAll();
    EXPECT_EQ(table.size(), 2) << "the buckets stay";
}

TEST(CmHashTable, UsesItsOwnHashFunction)
{
    CmHashTable table(4);
    table.setHashFunction(lastBucket);
    fill(table, 6);
    EXPECT_EQ(ranksOf(table), "0 1 2 3 4 5");
    const CmHashTable copied(table);
    EXPECT_EQ(ranksOf(copied), "0 1 2 3 4 5") << "a copy hashes alike";
    CmHashTable growing;
    growing.setAutoResize(true);
    CmHashTable alsoGrowing(growing);
    fill(alsoGrowing, 21);
    EXPECT_EQ(alsoGrowing.size(), 100);
    CmHashTable none(0);
    EXPECT_FALSE(none.add(table.at(0)));
    EXPECT_FALSE(none.contains(table.at(0)));
}

TEST(CmHashTable, AsksForEqualityAsTheElementsAreNow)
{
    CmHashTable table(1);
    CmString element("before"), before("before"), after("after");
    ASSERT_TRUE(table.add(&element));
    element.assign("after");
    EXPECT_EQ(table.lookup(&after), &element);
    EXPECT_FALSE(table.contains(&before));
    EXPECT_TRUE(table.remove(&element));
}

TEST(CmBTree, RaisesSmallOrders)
{
    EXPECT_EQ(CmBTree(1).getOrder(), 3);
    EXPECT_EQ(CmBTree(-5).getOrder(), 3);
    EXPECT_EQ(CmBTree(4).getOrder(), 4);
}

TEST(CmBTree, SplitsAtTheMiddleKey)
{
    OpenTree three(3), five(5);
    for (int rank : {1, 2, 3})
        three.add(new Item(rank));
    EXPECT_EQ(three.height(), 2);
    EXPECT_EQ(rankOf(three.root()->keys[0]), 2);
    for (int rank : {1, 2, 3, 4})
        five.add(new Item(rank));
    EXPECT_EQ(five.height(), 1);
    five.add(new Item(5));
    EXPECT_EQ(rankOf(five.root()->keys[0]), 3);
}

TEST(CmBTree, TriesTheRightSiblingFirst)
{
    // Order 3 in two levels: 2 keys, three leaves.
    OpenTree tree(3);
    for (int rank : {10, 20, 30, 40, 50, 5, 55})
        tree.add(new Item(rank));
    ASSERT_EQ(tree.height(), 2);
    const auto leafRanks = [&tree](int child)
    {
        const CmBTreeNode* leaf = tree.root()->children[child];
        std::vector<int> ranks;
        for (int i = 0; i < leaf->count; i++)
            ranks.push_back(rankOf(leaf->keys[i]));
        return ranks;
    };
    ASSERT_EQ(leafRanks(0), (std::vector<int>{5, 10}));
    ASSERT_EQ(leafRanks(1), (std::vector<int>{30}));
    ASSERT_EQ(leafRanks(2), (std::vector<int>{50, 55}));
    Item thirty(30);
    tree.remove(&thirty);
    EXPECT_EQ(leafRanks(0), (std::vector<int>{5, 10}))
        << "the left sibling lends nothing while there is a right one";
    EXPECT_EQ(leafRanks(1), (std::vector<int>{40}));
    EXPECT_EQ(leafRanks(2), (std::vector<int>{55}));
}

TEST(CmBTree, LosesItsRootWithTheLastKey)
{
    OpenTree tree(3);
    auto* item = new Item(1);
    tree.add(item);
    EXPECT_EQ(tree.height(), 1);
    EXPECT_TRUE(tree.remove(item));
    EXPECT_TRUE(tree.isEmpty());
    EXPECT_EQ(tree.height(), 0);
    EXPECT_EQ(tree.root(), nullptr);
    EXPECT_FALSE(tree.removeAt(0));
}

class BTreeOrderTest : public testing::TestWithParam<int>
{
};
INSTANTIATE_TEST_SUITE_P(Orders, BTreeOrderTest, testing::Values(3, 4, 5, 6, 7, 10, CmBTree::kDefaultOrder));

TEST_P(BTreeOrderTest, StaysSoundAndSortedUnderRandomWork)
{
    OpenTree tree(GetParam());
    std::mt19937 random(static_cast<unsigned>(GetParam()));
    std::vector<CmObject*> expected;
    const auto before = [](const CmObject* left, const CmObject* right) { return left->compare(right) < 0; };
    for (int step = 0; step < 3000; step++)
    {
        const bool grows = step < 1500 ? random() % 3 != 0 : random() % 3 == 0;
        if (grows || expected.empty())
        {
            auto* item = new Item(static_cast<int>(random() % 60));
            tree.add(item);
            expected.insert(std::upper_bound(expected.begin(), expected.end(), item, before), item);
        }
        else
        {
            const size_t index = random() % expected.size();
            if (step % 2 == 0)
                tree.removeAt(static_cast<int>(index));
            else
            {
                const auto it = iterate(tree);
                *it += static_cast<int>(index);
                tree.remove(*it);
                const CmObject* next = index + 1 < expected.size() ? expected[index + 1] : nullptr;
                ASSERT_EQ(it->current(), next);
            }
            expected.erase(expected.begin() + static_cast<std::ptrdiff_t>(index));
        }
        if (step % 50 == 0)
            tree.expectSound();
    }
    tree.expectSound();
    size_t index = 0;
    for (auto it = iterate(tree); !it->done();)
        ASSERT_EQ(it->next(), expected[index++]) << "equal ones must keep their order of insertion";
    ASSERT_EQ(index, expected.size());
    const auto it = iterate(tree);
    for (it->last(); !it->done();)
        ASSERT_EQ(it->previous(), expected[--index]);
}

TEST(CmBTree, FindsTheFirstOfEqualElements)
{
    OpenTree tree(3);
    std::string marks;
    for (char mark = 'a'; mark < 'a' + 20; mark++)
    {
        tree.add(new Item(mark % 3, mark));
        if (mark % 3 == 1)
            marks += mark;
    }
    Item one(1);
    EXPECT_EQ(static_cast<Item*>(tree.lookup(&one))->mark, marks[0]);
    EXPECT_EQ(tree.occurrences(&one), static_cast<int>(marks.size()));
    CmObject* last = tree.at(tree.getIndex(&one) + static_cast<int>(marks.size()) - 1);
    EXPECT_EQ(tree.lookupAbs(last), last);
    EXPECT_EQ(tree.lookupAbs(&one), nullptr);
    EXPECT_TRUE(tree.remove(&one));
    EXPECT_EQ(static_cast<Item*>(tree.lookup(&one))->mark, marks[1]);
    EXPECT_EQ(tree.occurrences(&one), static_cast<int>(marks.size()) - 1);
}
