#include "../testobject.h"

#include "containers/sequence/cmarray.h"
#include "containers/sequence/cmdlinkedlist.h"
#include "containers/sequence/cmqueue.h"
#include "containers/sequence/cmstack.h"
#include "foundation/object/iptr.h"

#include <gtest/gtest.h>

namespace
{
template <class List>
class ListTest : public testing::Test
{
protected:
    using Element = typename ElementOf<List>::Type;

    ListTest() { list.takeElements(); }
    Element* make(int rank) { return new Element(rank); }
    void fill(std::initializer_list<int> ranks)
    {
        for (int rank : ranks)
            list.add(make(rank));
    }
    void TearDown() override
    {
        list.removeAll();
        EXPECT_EQ(Item::alive, 0);
    }
    /// Both ways, so that every link is seen.
    void expectRanks(const char* forwards, const char* backwards)
    {
        EXPECT_EQ(ranksOf(list), forwards);
        EXPECT_EQ(ranksBackwards(list), backwards);
    }

    List list;
};

using Lists = testing::Types<CmLinkedList, CmDLinkedList, CmILinkedList, CmIDLinkedList>;
TYPED_TEST_SUITE(ListTest, Lists);
} // namespace

TYPED_TEST(ListTest, InsertsAtEveryKindOfPlace)
{
    this->fill({2, 3});
    this->list.prepend(this->make(1));
    this->list.append(this->make(4));
    EXPECT_TRUE(this->list.insertBefore(this->list.first(), this->make(5)));
    EXPECT_TRUE(this->list.insertAfter(this->list.last(), this->make(6)));
    const auto it = iterate(this->list);
    *it += 2;
    EXPECT_TRUE(this->list.insertBefore(*it, this->make(7)));
    EXPECT_TRUE(this->list.insertAfter(*it, this->make(8)));
    EXPECT_TRUE(this->list.insertAt(0, this->make(9)));
    EXPECT_TRUE(this->list.insertAt(9, this->make(10)));
    this->expectRanks("9 5 1 7 2 8 3 4 6 10", "10 6 4 3 8 2 7 1 5 9");

    typename TestFixture::Element spare(0);
    EXPECT_FALSE(this->list.insertAt(11, &spare));
    EXPECT_FALSE(this->list.insertBefore(&spare, &spare));
    EXPECT_FALSE(this->list.insertAfter(nullptr, &spare));
    *it += 99;
    EXPECT_FALSE(this->list.insertBefore(*it, &spare));
    EXPECT_EQ(this->list.total(), 10);
}

TYPED_TEST(ListTest, HandsItsEndsToTheCaller)
{
    this->fill({1, 2, 3});
    const IPtr<CmObject> first = adopt(this->list.removeFirst());
    const IPtr<CmObject> last = adopt(this->list.removeLast());
    EXPECT_EQ(rankOf(first), 1);
    EXPECT_EQ(rankOf(last), 3);
    EXPECT_EQ(first->getRefCount(), 1u) << "the reference passes to the caller";
    this->expectRanks("2", "2");
    adopt(this->list.removeLast());
    EXPECT_EQ(this->list.removeFirst(), nullptr);
    EXPECT_EQ(this->list.removeLast(), nullptr);
    this->fill({4, 5});
    this->expectRanks("4 5", "5 4");
}

TYPED_TEST(ListTest, RemovesByEqualityOrIdentity)
{
    this->fill({1, 2, 1, 3});
    typename TestFixture::Element one(1);
    CmObject* secondOne = this->list.at(2);
    EXPECT_FALSE(this->list.removeAbs(&one));
    EXPECT_TRUE(this->list.removeAbs(secondOne));
    this->expectRanks("1 2 3", "3 2 1");
    EXPECT_TRUE(this->list.remove(static_cast<CmObject*>(&one)));
    EXPECT_FALSE(this->list.remove(static_cast<CmObject*>(&one)));
    EXPECT_TRUE(this->list.removeAt(1));
    this->expectRanks("2", "2");
    EXPECT_EQ(this->list.index(this->list.first()), 0);
}

TYPED_TEST(ListTest, ReplacesAndSorts)
{
    this->fill({1, 2, 3});
    EXPECT_TRUE(this->list.replaceAt(0, this->make(4)));
    EXPECT_TRUE(this->list.replaceAt(2, this->make(5)));
    EXPECT_TRUE(this->list.replaceAt(1, this->list.at(1))) << "must not release what stays";
    EXPECT_FALSE(this->list.replaceAt(3, this->list.at(0)));
    this->expectRanks("4 2 5", "5 2 4");
    this->list.removeAll();
    for (int rank : {3, 1, 2, 1, 3})
        EXPECT_TRUE(this->list.addSorted(this->make(rank)));
    this->expectRanks("1 1 2 3 3", "3 3 2 1 1");
    auto* equal = this->make(2);
    EXPECT_TRUE(this->list.addSorted(equal));
    EXPECT_EQ(this->list.at(3), equal) << "behind its equals";
}

TEST(CmLinkedList, AddsPointersWithoutCopies)
{
    CmArray source;
    source.takeElements();
    source.add(new Item(1));
    CmLinkedList list;
    list.retainElements();
    list.addAllFromAbs(source);
    EXPECT_EQ(list.first(), source.at(0));
    EXPECT_EQ(source.at(0)->getRefCount(), 2u);
}

TEST(CmQueue, GivesFirstInFirstOut)
{
    Item one(1), two(2);
    CmQueue queue;
    EXPECT_EQ(queue.dequeue(), nullptr);
    queue.enqueue(&one);
    queue.enqueue(&two);
    EXPECT_EQ(queue.peek(), &one);
    EXPECT_EQ(queue.dequeue(), &one);
    EXPECT_EQ(queue.dequeue(), &two);
    EXPECT_EQ(queue.peek(), nullptr);
}

TEST(CmStack, GivesLastInFirstOut)
{
    Item one(1), two(2), three(3);
    CmStack stack;
    for (Item* item : {&one, &two, &three})
        stack.push(item);
    EXPECT_EQ(stack.peek(), &three);
    EXPECT_EQ(stack.removeBottom(), &one);
    EXPECT_EQ(stack.pop(), &three);
    EXPECT_EQ(stack.pop(), &two);
    EXPECT_EQ(stack.pop(), nullptr);
}

template <class List>
class IntrusiveListTest : public ListTest<List>
{
};
using IntrusiveLists = testing::Types<CmILinkedList, CmIDLinkedList>;
TYPED_TEST_SUITE(IntrusiveListTest, IntrusiveLists);

TYPED_TEST(IntrusiveListTest, MovesWholeLists)
{
    TypeParam other;
    other.takeElements();
    this->fill({1, 2});
    for (int rank : {3, 4})
        other.add(this->make(rank));
    this->list.appendList(other);
    this->expectRanks("1 2 3 4", "4 3 2 1");
    EXPECT_TRUE(other.isEmpty());
    other.add(this->make(5));
    other.retainElements();
    this->list.prependList(other);
    EXPECT_EQ(this->list.getOwnership(), 1) << "the modes stay";
    EXPECT_EQ(other.getOwnership(), 2);
    this->list.prependList(other);
    this->list.appendList(this->list);
    this->expectRanks("5 1 2 3 4", "4 3 2 1 5");

    other.add(this->make(6));
    other.swap(this->list);
    EXPECT_EQ(this->list.getOwnership(), 2) << "the modes go with the elements";
    this->list.first()->release();
    this->expectRanks("6", "6");
    EXPECT_EQ(ranksOf(other), "5 1 2 3 4");
    this->list.takeOver(other);
    EXPECT_EQ(this->list.getOwnership(), 1);
    this->expectRanks("5 1 2 3 4", "4 3 2 1 5");
    EXPECT_TRUE(other.isEmpty());
    other.appendList(this->list);
    EXPECT_EQ(ranksBackwards(other), "4 3 2 1 5");
}

TYPED_TEST(IntrusiveListTest, RefusesWhatCannotBeLinked)
{
    this->fill({1, 2});
    Item unlinkable;
    EXPECT_FALSE(this->list.add(&unlinkable));
    EXPECT_FALSE(this->list.add(this->list.first())) << "it stands here already";
    this->list.removeAt(0);
    EXPECT_FALSE(this->list.add(this->list.first()));
    this->expectRanks("2", "2");
}

TYPED_TEST(IntrusiveListTest, RemovesThisVeryLink)
{
    this->fill({1, 2, 1});
    auto* last = static_cast<typename TestFixture::Element*>(this->list.last());
    EXPECT_TRUE(this->list.remove(last)) << "not the first equal one";
    this->expectRanks("1 2", "2 1");
    typename TestFixture::Element equal(1);
    EXPECT_FALSE(this->list.remove(&equal));
}

TYPED_TEST(IntrusiveListTest, CopyOfSharedElementsIsEmpty)
{
    this->fill({1, 2});
    TypeParam owning(this->list);
    EXPECT_EQ(ranksOf(owning), "1 2");
    this->list.shareElements();
    const TypeParam sharing(this->list);
    EXPECT_TRUE(sharing.isEmpty()) << "an element can stand in one list only";
    this->expectRanks("1 2", "2 1");
    this->list.takeElements();
}

TEST(CmIDLinkedList, LeavesALinkOfAnotherListUntouched)
{
    LinkedItem<CmIDLink> mine[3] = {LinkedItem<CmIDLink>(1), LinkedItem<CmIDLink>(2),
                                    LinkedItem<CmIDLink>(3)};
    LinkedItem<CmIDLink> theirs[3] = {LinkedItem<CmIDLink>(4), LinkedItem<CmIDLink>(5),
                                      LinkedItem<CmIDLink>(6)};
    CmIDLinkedList list, other;
    for (int i = 0; i < 3; i++)
    {
        list.add(&mine[i]);
        other.add(&theirs[i]);
    }
    LinkedItem<CmIDLink> nowhere(7);
    EXPECT_FALSE(list.remove(&nowhere));
    EXPECT_FALSE(list.removeAbs(&nowhere));
    for (LinkedItem<CmIDLink>& link : theirs)
        EXPECT_FALSE(list.remove(&link)) << link.rank;
    EXPECT_EQ(ranksOf(other), "4 5 6");
    EXPECT_TRUE(list.remove(&mine[1]));
    EXPECT_TRUE(list.removeAbs(&mine[0]));
    EXPECT_EQ(ranksOf(list), "3");
    EXPECT_EQ(ranksBackwards(list), "3");
    EXPECT_TRUE(list.remove(&mine[2]));
    EXPECT_FALSE(list.remove(&mine[2]));
    EXPECT_TRUE(list.isEmpty());
    EXPECT_TRUE(other.add(&mine[1])) << "a removed link is free";
}
