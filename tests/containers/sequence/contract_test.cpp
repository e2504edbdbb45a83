// What all containers have in common.

#include "../testobject.h"

#include "containers/keyed/cmbtree.h"
#include "containers/keyed/cmhashtable.h"
#include "containers/sequence/cmarray.h"
#include "containers/sequence/cmdlinkedlist.h"
#include "containers/sequence/cmobjectfilter.h"
#include "containers/sequence/cmorderedarray.h"
#include "containers/sequence/cmqueue.h"
#include "containers/sequence/cmstack.h"
#include "foundation/object/iptr.h"
#include "foundation/thread/fcpuinfo.h"

#include <gtest/gtest.h>

#include <atomic>
#include <mutex>
#include <set>
#include <thread>
#include <vector>

namespace
{
template <class Container>
class ContractTest : public testing::Test
{
protected:
    using Element = typename ElementOf<Container>::Type;

    Element* make(int rank) { return new Element(rank); }
    void TearDown() override { EXPECT_EQ(Item::alive, 0) << "every element must be released"; }
};

using AllContainers = testing::Types<CmArray, CmOrderedArray, CmLinkedList, CmDLinkedList, CmQueue, CmStack,
                                     CmILinkedList, CmIDLinkedList, CmHashTable, CmBTree>;
TYPED_TEST_SUITE(ContractTest, AllContainers);
} // namespace

TYPED_TEST(ContractTest, OwnershipModeSaysWhoReleases)
{
    auto* element = this->make(1);
    {
        TypeParam shared;
        EXPECT_EQ(shared.getOwnership(), 0);
        EXPECT_TRUE(shared.add(element));
        EXPECT_EQ(element->getRefCount(), 1u);
        EXPECT_TRUE(shared.remove(element));
        shared.add(element);
    }
    EXPECT_EQ(element->getRefCount(), 1u);
    {
        TypeParam retaining;
        retaining.retainElements();
        retaining.add(element);
        EXPECT_EQ(element->getRefCount(), 2u);
        retaining.remove(element);
        EXPECT_EQ(element->getRefCount(), 1u);
        retaining.add(element);
    }
    EXPECT_EQ(element->getRefCount(), 1u);
    {
        element->addRef();
        TypeParam taking;
        taking.takeElements();
        taking.add(element);
        EXPECT_EQ(element->getRefCount(), 2u);
    }
    EXPECT_EQ(element->getRefCount(), 1u);
    element->release();
}

TYPED_TEST(ContractTest, FindsElementsByEquality)
{
    TypeParam container;
    container.takeElements();
    for (int rank : {3, 1, 2, 1})
        EXPECT_TRUE(container.add(this->make(rank)));
    const typename TestFixture::Element one(1), nine(9);
    EXPECT_EQ(container.total(), 4);
    EXPECT_EQ(container.occurrences(&one), 2);
    EXPECT_TRUE(container.contains(&one));
    EXPECT_FALSE(container.contains(&nine));
    EXPECT_FALSE(container.containsAbs(&one));
    CmObject* found = container.lookup(&one);
    ASSERT_TRUE(found);
    EXPECT_TRUE(container.containsAbs(found));
    EXPECT_EQ(container.at(container.getIndex(&one)), found);
    EXPECT_EQ(container.getIndex(&nine), -1);
    EXPECT_EQ(container.lookup(&nine), nullptr);
    EXPECT_EQ(container.at(4), nullptr);
    EXPECT_EQ(container.at(-1), nullptr);
    const IPtr<CmArray> all = adopt(container.lookupAll(&one));
    EXPECT_EQ(all->total(), 2);
    EXPECT_EQ(found->getRefCount(), 1u);
}

TYPED_TEST(ContractTest, RefusesNullEverywhere)
{
    TypeParam container;
    EXPECT_FALSE(container.add(nullptr));
    EXPECT_FALSE(container.remove(static_cast<CmObject*>(nullptr)));
    EXPECT_EQ(container.lookup(nullptr), nullptr);
    EXPECT_FALSE(container.contains(nullptr));
    EXPECT_EQ(container.occurrences(nullptr), 0);
    EXPECT_EQ(container.getIndex(nullptr), -1);
    EXPECT_FALSE(container.removeAt(0));
    EXPECT_TRUE(container.isEmpty());
    EXPECT_FALSE(container.addAllFrom(nullptr));
}

TYPED_TEST(ContractTest, IteratorStopsAtBothEnds)
{
    TypeParam container;
    container.takeElements();
    for (int rank : {1, 2, 3, 4, 5})
        container.add(this->make(rank));
    const auto it = iterate(container);
    EXPECT_EQ(it->current(), it->first());
    *it += 4;
    EXPECT_EQ(it->current(), container.at(4));
    EXPECT_EQ(it->next(), container.at(4));
    EXPECT_EQ(it->next(), nullptr);
    EXPECT_TRUE(it->done());
    EXPECT_EQ(it->current(), nullptr);
    EXPECT_EQ(it->last(), container.at(4));
    EXPECT_EQ(*it -= 4, container.at(0));
    EXPECT_EQ(it->previous(), container.at(0));
    EXPECT_TRUE(it->done());
    EXPECT_EQ(it->previous(), nullptr);
    EXPECT_TRUE(it->setCurrent(container.at(2)));
    EXPECT_EQ(it->next(container.at(3)), container.at(3));
    EXPECT_EQ(it->current(), container.at(4));
    EXPECT_EQ(it->previous(container.at(1)), container.at(1));
    EXPECT_EQ(it->current(), container.at(0));
    const typename TestFixture::Element elsewhere(2);
    EXPECT_FALSE(it->setCurrent(const_cast<typename TestFixture::Element*>(&elsewhere)));
    EXPECT_TRUE(it->done());
}

TYPED_TEST(ContractTest, RemovesUnderTheCursor)
{
    TypeParam container;
    container.takeElements();
    std::vector<CmObject*> kept;
    for (int rank = 0; rank < 40; rank++)
        container.add(this->make(rank));
    for (auto it = iterate(container); !it->done();)
        if (rankOf(it->current()) % 3 == 0)
            kept.push_back(it->next());
        else
            EXPECT_TRUE(container.remove(*it));
    EXPECT_EQ(container.total(), 14);
    int index = 0;
    for (auto it = iterate(container); !it->done();)
        EXPECT_EQ(it->next(), kept[static_cast<size_t>(index++)]);
    const auto atEnd = iterate(container);
    atEnd->last();
    EXPECT_TRUE(container.remove(*atEnd));
    EXPECT_TRUE(atEnd->done());
    EXPECT_FALSE(container.remove(*atEnd));
    TypeParam other;
    const auto foreign = iterate(container);
    EXPECT_FALSE(other.remove(*foreign)) << "an iterator over another container";
    EXPECT_TRUE(container.removeAt(0));
    EXPECT_FALSE(container.removeAt(container.total()));
}

TYPED_TEST(ContractTest, CopiesAsTheModeOfTheSourceSays)
{
    TypeParam source;
    source.takeElements();
    for (int rank : {1, 2, 3})
        source.add(this->make(rank));
    {
        TypeParam target;
        target.copy(source);
        EXPECT_EQ(target.getOwnership(), 1);
        EXPECT_EQ(target.total(), 3);
        EXPECT_FALSE(target.containsAbs(source.at(0)));
        target = source;
        EXPECT_EQ(target.total(), 3) << "assignment removes what was there";
        const IPtr<CmObject> copied = adopt(source.newCopy());
        EXPECT_TRUE(copied->isA(source.isA()));
        EXPECT_EQ(ranksOf(*static_cast<CmContainer*>(copied.get())), ranksOf(TypeParam(source)));
        EXPECT_EQ(Item::alive, 12 - 3);
    }
    EXPECT_EQ(Item::alive, 3);
}

TYPED_TEST(ContractTest, CopiesShareInTheOtherModes)
{
    // An element with links of its own can stand in one container only.
    const bool canShare = std::is_same_v<typename TestFixture::Element, Item>;
    const IPtr<CmObject> element = adopt(this->make(1));
    for (int16 mode : {CmContainer::kShared, CmContainer::kRetained})
    {
        TypeParam source;
        source.setOwnership(mode);
        source.add(element);
        const unsigned perContainer = mode == CmContainer::kRetained ? 1 : 0;
        const TypeParam copied(source);
        EXPECT_EQ(copied.getOwnership(), mode);
        EXPECT_EQ(copied.containsAbs(element), canShare);
        EXPECT_EQ(element->getRefCount(), 1 + perContainer * (canShare ? 2 : 1));
    }
    CmArray array;
    array.add(element);
    TypeParam fromArray;
    fromArray.copy(array);
    EXPECT_TRUE(fromArray.containsAbs(element)) << "free elements can be linked";
}

TYPED_TEST(ContractTest, TakesAllWithOrWithoutAReference)
{
    CmArray source;
    source.takeElements();
    for (int rank : {1, 2, 3})
        source.add(this->make(rank));
    {
        TypeParam target;
        target.takeElements();
        EXPECT_TRUE(target.takeAllFrom(&source, true));
        EXPECT_EQ(source.at(0)->getRefCount(), 2u);
        EXPECT_EQ(source.total(), 3);
        target.removeAllFrom(&source);
        EXPECT_TRUE(target.isEmpty());
        EXPECT_EQ(source.at(0)->getRefCount(), 1u);
        target.retainElements();
        EXPECT_TRUE(target.takeAllFrom(&source, false));
        EXPECT_EQ(source.at(0)->getRefCount(), 1u) << "whatever the mode";
        EXPECT_EQ(target.getOwnership(), 2);
        target.shareElements();
    }
}

namespace
{
/// Passes ranks below a limit, and notes what it was asked.
class BelowFilter : public CmObjectFilter
{
public:
    explicit BelowFilter(int rankLimit) : limit(rankLimit) {}
    bool check(CmObject* object) override
    {
        asked++;
        return rankOf(object) < limit;
    }

    int limit;
    int asked = 0;
};

CmArray& fill(CmArray& array, int count)
{
    array.takeElements();
    for (int rank = 0; rank < count; rank++)
        array.add(new Item(rank));
    return array;
}
} // namespace

TEST(CmContainer, AsksFilters)
{
    CmArray array;
    fill(array, 10);
    BelowFilter belowThree(3), none(0), all(100);
    CmArray result;
    EXPECT_TRUE(array.query(belowThree, result));
    EXPECT_EQ(ranksOf(result), "0 1 2");
    EXPECT_FALSE(array.query(none, result));
    EXPECT_TRUE(result.query(belowThree, result)) << "must come to an end";
    EXPECT_EQ(ranksOf(result), "0 1 2 0 1 2");
    EXPECT_EQ(array.firstThat(none), nullptr);
    EXPECT_EQ(array.lastThat(belowThree), array.at(2));
    BelowFilter stopping(3);
    EXPECT_FALSE(array.forEach(stopping));
    EXPECT_EQ(stopping.asked, 4) << "stops at the first false";
    EXPECT_TRUE(array.forEach(all));

    CmIdentityFilter identity(array.at(4));
    EXPECT_EQ(array.firstThat(identity), array.at(4));
    CmIsAFilter exact("Item"), exactBase("CmObject");
    EXPECT_EQ(array.firstThat(exact), array.at(0));
    EXPECT_EQ(array.firstThat(exactBase), nullptr);
    CmTypeFilter type("CmObject");
    CmMacroFilter both(type, identity);
    EXPECT_EQ(array.lastThat(type), array.at(9));
    EXPECT_EQ(array.lastThat(both), array.at(4));
}

TEST(CmContainer, AddsItselfOnce)
{
    CmLinkedList list;
    list.takeElements();
    list.add(new Item(1));
    list.add(new Item(2));
    EXPECT_TRUE(list.addAllFrom(&list));
    EXPECT_EQ(ranksOf(list), "1 2 1 2");
    list.removeAllFrom(&list);
    EXPECT_TRUE(list.isEmpty());
}

namespace
{
/// Counts how often each element is checked, from any thread.
class CoverageFilter : public CmObjectFilter
{
public:
    explicit CoverageFilter(int count, int firstRefused = -1)
        : checks(static_cast<size_t>(count)),
          refused(firstRefused)
    {
    }
    bool check(CmObject* object) override
    {
        checks[static_cast<size_t>(rankOf(object))]++;
        const std::lock_guard<std::mutex> guard(lock);
        callers.insert(std::this_thread::get_id());
        return rankOf(object) != refused;
    }
    bool hasCheckedEachOnce() const
    {
        for (const auto& count : checks)
            if (count != 1)
                return false;
        return true;
    }

    std::vector<std::atomic<int>> checks;
    std::mutex lock;
    std::set<std::thread::id> callers;
    int refused;
};
} // namespace

TEST(ConcurrentIteration, RunsFewElementsOnTheCallingThread)
{
    CmArray array;
    fill(array, 5);
    CoverageFilter filter(5);
    EXPECT_TRUE(array.concurrentIteration(filter, 4, 10));
    EXPECT_TRUE(filter.hasCheckedEachOnce());
    EXPECT_EQ(filter.callers, std::set<std::thread::id>{std::this_thread::get_id()});
    CoverageFilter refusing(5, 2);
    EXPECT_FALSE(array.concurrentIteration(refusing, 4, 10));
    EXPECT_EQ(refusing.checks[3], 0);
}

TEST(ConcurrentIteration, CoversEachElementOnceAndReversesItsResult)
{
    CmArray array;
    fill(array, 103);
    CmDLinkedList list;
    list.addAllFromAbs(array);
    for (const CmContainer* container : {static_cast<CmContainer*>(&array), static_cast<CmContainer*>(&list)})
    {
        CoverageFilter filter(103);
        EXPECT_FALSE(container->concurrentIteration(filter, 4, 10));
        EXPECT_TRUE(filter.hasCheckedEachOnce());
        CoverageFilter refusing(103, 102);
        EXPECT_TRUE(container->concurrentIteration(refusing, 4, 10));
    }
    CoverageFilter onAll(103);
    EXPECT_EQ(array.concurrentIteration(onAll, 0, 104), true) << "too few for a second thread";
}

TEST(ConcurrentIteration, LowersTheNumberOfThreadsToTheWork)
{
    CmArray array;
    fill(array, 25);
    CoverageFilter filter(25);
    EXPECT_FALSE(array.concurrentIteration(filter, 8, 10));
    EXPECT_TRUE(filter.hasCheckedEachOnce());
    EXPECT_EQ(filter.callers.size(), 2u);
}

namespace
{
/// Passes nothing.
class RefusingFilter : public CmObjectFilter
{
public:
    bool check(CmObject*) override
    {
        asked++;
        return false;
    }

    std::atomic<int> asked{0};
};
} // namespace

TEST(ConcurrentIteration, EveryThreadEndsAfterARefusal)
{
    CmArray array;
    fill(array, 100);
    RefusingFilter refusing;
    EXPECT_TRUE(array.concurrentIteration(refusing, 4, 1));
    EXPECT_LE(refusing.asked, 4) << "one for each thread at most";
}

TEST(ConcurrentIteration, TakesAllProcessorsByDefault)
{
    CmArray array;
    fill(array, 1000);
    CoverageFilter filter(1000);
    const bool isAlone = FCpuInfo().countAvailable() < 2;
    EXPECT_EQ(array.concurrentIteration(filter, 0, 1), isAlone);
    EXPECT_TRUE(filter.hasCheckedEachOnce());
}
