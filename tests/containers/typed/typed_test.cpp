#include "containers/typed/tarray.h"
#include "containers/typed/tassociationarray.h"
#include "containers/typed/tdlinkedlist.h"
#include "containers/typed/thashdictionary.h"
#include "containers/typed/tlinkedlist.h"
#include "foundation/object/cmobject.h"
#include "foundation/object/iptr.h"
#include "foundation/object/isortableptr.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace
{
template <class T>
std::vector<T> forwards(const TContainer<T>& container)
{
    std::vector<T> result;
    for (std::unique_ptr<TIterator<T>> it(container.newIterator()); !it->done();)
        result.push_back(it->next());
    return result;
}

template <class T>
std::vector<T> backwards(const TContainer<T>& container)
{
    std::vector<T> result;
    const std::unique_ptr<TIterator<T>> it(container.newIterator());
    for (it->last(); !it->done();)
        result.push_back(it->previous());
    return result;
}

using Ints = std::vector<int>;

unsigned hashByTens(const int& value, unsigned size)
{
    return static_cast<unsigned>(value / 10) % size;
}

unsigned hashText(const std::string& text, unsigned size)
{
    return static_cast<unsigned>(text.size()) % size;
}

/// Orders by `rank` alone.
struct Ranked
{
    bool operator==(const Ranked& other) const { return rank == other.rank; }
    bool operator<(const Ranked& other) const { return rank < other.rank; }

    int rank = 0;
    char mark = 0;
};

class Numbered : public CmObject
{
    DECLARE_COPYABLE(Numbered, CmObject)

    explicit Numbered(int itsNumber) : number(itsNumber) {}

    int number;
};

int compareNumbers(const Numbered* left, const Numbered* right)
{
    return left->number - right->number;
}
} // namespace

TEST(TArray, GrowsByItsStep)
{
    TArray<int> fixed(2, 0);
    EXPECT_TRUE(fixed.add(1));
    EXPECT_TRUE(fixed.add(2));
    EXPECT_FALSE(fixed.add(3));
    EXPECT_EQ(fixed.total(), 2);

    TArray<int> doubling(0, -1);
    Ints sizes;
    for (int i = 0; i < 21; i++)
    {
        doubling.add(i);
        if (sizes.empty() || sizes.back() != doubling.size())
            sizes.push_back(doubling.size());
    }
    EXPECT_EQ(sizes, (Ints{10, 20, 40}));

    TArray<int> stepping;
    for (int i = 0; i < 11; i++)
        stepping.add(i);
    EXPECT_EQ(stepping.size(), 20);
}

TEST(TArray, KeepsTheOrderOfInsertion)
{
    TArray<int> array;
    for (int value : {5, 3, 5, 1})
        array.add(value);
    EXPECT_EQ(forwards(array), (Ints{5, 3, 5, 1}));
    EXPECT_EQ(backwards(array), (Ints{1, 5, 3, 5}));
    EXPECT_EQ(array.index(5), 0);
    EXPECT_EQ(array.occurrences(5), 2);
    EXPECT_TRUE(array.remove(5));
    EXPECT_FALSE(array.remove(9));
    EXPECT_TRUE(array.doInsertAt(1, 7));
    EXPECT_FALSE(array.doInsertAt(5, 7));
    EXPECT_EQ(forwards(array), (Ints{3, 7, 5, 1}));
    EXPECT_EQ(array.at(4), 0) << "out of range gives the empty value";
    EXPECT_TRUE(array.resize(2));
    EXPECT_EQ(forwards(array), (Ints{3, 7}));
    EXPECT_FALSE(array.resize(-1));
}

TEST(TArray, TakesItsOwnElementAsArgument)
{
    TArray<std::string> array(1, 1);
    array.add("a text that is too long to be kept in place");
    array.add(array.at(0));
    array.doInsertAt(0, array.at(1));
    EXPECT_EQ(array.occurrences("a text that is too long to be kept in place"), 3);
}

TEST(TArray, OfPointersHoldsReferences)
{
    CmObject first, second;
    {
        TArray<IPtr<CmObject>> array(0, 1);
        array.add(&first);
        array.add(&second);
        array.add(&first);
        EXPECT_EQ(first.getRefCount(), 3u);
        const TArray<IPtr<CmObject>> copied(array);
        EXPECT_EQ(first.getRefCount(), 5u);
        array.removeAt(0);
        EXPECT_EQ(first.getRefCount(), 4u);
        array.removeAll();
        EXPECT_EQ(second.getRefCount(), 2u);
        EXPECT_EQ(copied.index(&second), 1);
    }
    EXPECT_EQ(first.getRefCount(), 1u);
    EXPECT_EQ(second.getRefCount(), 1u);
}

TEST(TOrderedArray, PutsEqualElementsBehindThosePresent)
{
    TOrderedArray<Ranked> array;
    for (const Ranked& element :
         {Ranked{2, 'a'}, Ranked{1, 'b'}, Ranked{2, 'c'}, Ranked{3, 'd'}, Ranked{2, 'e'}})
        array.add(element);
    std::string marks;
    for (const Ranked& element : array)
        marks += element.mark;
    EXPECT_EQ(marks, "baced");
    EXPECT_EQ(array.index({2, 0}), 1);
    EXPECT_EQ(array.index({4, 0}), -1);
    EXPECT_EQ(array.occurrences({2, 0}), 3);
    array.remove({2, 0});
    EXPECT_EQ(array.at(1).mark, 'c');
}

TEST(TOrderedArray, SortsPointersByTheirComparer)
{
    TOrderedArray<ISortablePtr<Numbered, compareNumbers>> array;
    for (int number : {3, 1, 2})
        array.add(adopt(new Numbered(number)));
    EXPECT_EQ(array.at(0)->number, 1);
    EXPECT_EQ(array.at(2)->number, 3);
    EXPECT_EQ(array.at(0)->getRefCount(), 1u);
}

template <class List>
class TypedListTest : public testing::Test
{
};
using TypedLists = testing::Types<TLinkedList<int>, TDLinkedList<int>>;
TYPED_TEST_SUITE(TypedListTest, TypedLists);

TYPED_TEST(TypedListTest, InsertsAndRemovesAtAnyPlace)
{
    TypeParam list;
    list.add(2);
    list.append(3);
    list.prepend(1);
    EXPECT_TRUE(list.insertAt(3, 4));
    EXPECT_TRUE(list.insertAt(1, 9));
    EXPECT_FALSE(list.insertAt(6, 0));
    EXPECT_EQ(forwards(list), (Ints{1, 9, 2, 3, 4}));
    EXPECT_EQ(backwards(list), (Ints{4, 3, 2, 9, 1}));
    EXPECT_EQ(list.index(3), 3);
    EXPECT_TRUE(list.remove(9));
    EXPECT_TRUE(list.removeAt(3));
    EXPECT_EQ(list.last(), 3);
    EXPECT_TRUE(list.removeFirst());
    EXPECT_TRUE(list.removeLast());
    EXPECT_EQ(forwards(list), (Ints{2}));
    EXPECT_TRUE(list.removeLast());
    EXPECT_FALSE(list.removeLast());
    list.add(5);
    EXPECT_EQ(forwards(list), (Ints{5})) << "an emptied list must be fit for use";
}

TYPED_TEST(TypedListTest, RemovesUnderTheCursor)
{
    TypeParam list;
    for (int i = 1; i <= 6; i++)
        list.add(i);
    typename TypeParam::Iterator it(list);
    while (!it.done())
    {
        if (it.current() % 2 == 0)
            list.remove(it);
        else
            it.next();
    }
    EXPECT_EQ(forwards(list), (Ints{1, 3, 5}));
    EXPECT_EQ(backwards(list), (Ints{5, 3, 1}));
}

TEST(TContainer, NewInstanceIsEmptyAndOfTheSameType)
{
    TOrderedArray<int> array;
    array.add(1);
    const std::unique_ptr<TContainer<int>> instance(array.newInstance());
    EXPECT_TRUE(instance->isEmpty());
    instance->add(2);
    instance->add(1);
    EXPECT_EQ(forwards(*instance), (Ints{1, 2}));
}

TEST(THashTable, WalksThroughBucketsInOrder)
{
    THashTable<int> table(3, hashByTens);
    for (int value : {21, 5, 12, 7, 31, 5})
        table.add(value);
    EXPECT_EQ(forwards(table), (Ints{5, 7, 31, 5, 12, 21}));
    EXPECT_EQ(backwards(table), (Ints{21, 12, 5, 31, 7, 5}));
    EXPECT_EQ(table.total(), 6);
    EXPECT_EQ(table.size(), 3);
    EXPECT_EQ(table.occurrences(5), 2);
    EXPECT_TRUE(table.remove(5));
    EXPECT_TRUE(table.contains(5));
    EXPECT_TRUE(table.removeAt(4));
    EXPECT_FALSE(table.removeAt(4));
    EXPECT_EQ(forwards(table), (Ints{7, 31, 5, 12}));
}

TEST(THashTable, RefusesWithoutHashFunction)
{
    THashTable<int> table(3, nullptr);
    EXPECT_FALSE(table.add(1));
    EXPECT_FALSE(table.contains(1));
}

TEST(THashDictionary, KeepsTheFirstValueOfAKey)
{
    THashDictionary<std::string, int, hashText> dictionary(4);
    EXPECT_TRUE(dictionary.add("one", 1));
    EXPECT_TRUE(dictionary.add("two", 2));
    EXPECT_FALSE(dictionary.add("one", 3));
    ASSERT_TRUE(dictionary.lookup("one"));
    EXPECT_EQ(*dictionary.lookup("one"), 1);
    *dictionary.lookup("one") = 4;
    EXPECT_EQ(*dictionary.lookup("one"), 4);
    EXPECT_EQ(dictionary.lookup("six"), nullptr);
    EXPECT_TRUE(dictionary.remove("one"));
    EXPECT_EQ(dictionary.total(), 1);
}

TEST(TAssociationArray, FindsByKeyInOrderOfInsertion)
{
    TAssociationArray<std::string, int> array;
    array.add("b", 1);
    array.add("a", 2);
    EXPECT_FALSE(array.addUnique("b", 3));
    array.set("a", 5);
    array.set("c", 6);
    EXPECT_EQ(array.at(0).key, "b");
    EXPECT_EQ(*array.lookupKey("a"), 5);
    EXPECT_EQ(array.lookupKey("d"), nullptr);
    EXPECT_TRUE(array.removeKey("b"));
    EXPECT_EQ(array.indexOfKey("a"), 0);
}
