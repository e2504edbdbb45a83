#include "../testobject.h"

#include "containers/keyed/cmbtreedictionary.h"
#include "containers/keyed/cmdictionary.h"
#include "containers/keyed/cmhashdictionary.h"
#include "containers/sequence/cmarray.h"
#include "foundation/object/iptr.h"

#include <gtest/gtest.h>

#include <memory>

TEST(CmAssociation, IsComparedByItsKey)
{
    Item one(1), sameOne(1), two(2), object(3), otherObject(4);
    const CmAssociation first(&one, &object), same(&sameOne, &otherObject), greater(&two, &object), keyless;
    EXPECT_TRUE(first.isEqual(&same));
    EXPECT_FALSE(first.isEqual(&greater));
    EXPECT_FALSE(first.isEqual(&one));
    EXPECT_FALSE(keyless.isEqual(&keyless));
    EXPECT_EQ(first.compare(&same), 0);
    EXPECT_LT(first.compare(&greater), 0);
    EXPECT_EQ(first.compare(&one), -1);
    EXPECT_EQ(keyless.compare(&first), -1);
    EXPECT_EQ(first.hash(7), one.hash(7));
    EXPECT_EQ(keyless.hash(7), keyless.CmObject::hash(7));
}

namespace
{
template <class Dictionary>
class DictionaryTest : public testing::Test
{
protected:
    void TearDown() override { EXPECT_EQ(Item::alive, 0); }
};
using Dictionaries = testing::Types<CmDictionary, CmHashDictionary, CmBTreeDictionary>;
TYPED_TEST_SUITE(DictionaryTest, Dictionaries);

/// Keys 0 to `count` - 1, each with ten times itself.
void fill(auto& dictionary, int count)
{
    dictionary.takeElements();
    for (int rank = 0; rank < count; rank++)
        EXPECT_TRUE(dictionary.add(new Item(rank), new Item(10 * rank)));
}
} // namespace

TYPED_TEST(DictionaryTest, FindsObjectsByEqualKeys)
{
    TypeParam dictionary;
    fill(dictionary, 40);
    const Item key(7), absent(99);
    EXPECT_EQ(rankOf(dictionary.lookupObject(&key)), 70);
    EXPECT_EQ(dictionary.lookup(&key), dictionary.lookupObject(&key));
    EXPECT_EQ(rankOf(dictionary.lookupAssoc(&key)->getKey()), 7);
    EXPECT_TRUE(dictionary.contains(&key));
    EXPECT_EQ(dictionary.occurrences(&key), 1);
    EXPECT_EQ(dictionary.lookup(&absent), nullptr);
    EXPECT_EQ(dictionary.lookupAssoc(nullptr), nullptr);
    EXPECT_EQ(dictionary.occurrences(&absent), 0);
}

TYPED_TEST(DictionaryTest, KeepsThePairOfAPresentKey)
{
    TypeParam dictionary;
    fill(dictionary, 3);
    Item key(1), object(5);
    EXPECT_FALSE(dictionary.add(&key, &object));
    const IPtr<CmAssociation> ready = adopt(new CmAssociation(&key, &object));
    EXPECT_FALSE(dictionary.add(ready));
    EXPECT_FALSE(dictionary.add(&key)) << "no association";
    EXPECT_FALSE(dictionary.add(nullptr, &object));
    EXPECT_EQ(rankOf(dictionary.lookup(&key)), 10);
    EXPECT_EQ(key.getRefCount() + object.getRefCount() + ready->getRefCount(), 3u);
    EXPECT_EQ(dictionary.total(), 3);
}

TYPED_TEST(DictionaryTest, ReleasesKeyAndObjectInMode1)
{
    TypeParam dictionary;
    fill(dictionary, 6);
    Item key(2);
    EXPECT_TRUE(dictionary.remove(&key));
    EXPECT_FALSE(dictionary.remove(&key));
    EXPECT_TRUE(dictionary.removeAt(0));
    const auto it = iterate(dictionary);
    EXPECT_TRUE(dictionary.remove(*it));
    EXPECT_EQ(dictionary.total(), 3);
    EXPECT_EQ(Item::alive, 7);
    Item last(5);
    EXPECT_TRUE(dictionary.replace(&last, new Item(1)));
    EXPECT_TRUE(dictionary.replace(&last, dictionary.lookup(&last)));
    EXPECT_FALSE(dictionary.replace(&key, nullptr));
    EXPECT_EQ(rankOf(dictionary.lookup(&last)), 1);
    dictionary.removeAll();
    EXPECT_TRUE(dictionary.isEmpty());
    EXPECT_EQ(Item::alive, 2);
}

namespace
{
/// Asks its dictionary for every key while it goes.
class Curious : public CmObject
{
    DECLARE_COPYABLE(Curious, CmObject)

    explicit Curious(const CmContainer& asked) : dictionary(asked) {}
    ~Curious() override
    {
        for (int rank = 0; rank < 3; rank++)
            found += dictionary.contains(std::make_unique<Item>(rank).get()) ? 1 : 0;
    }

    inline static int found = 0;

    const CmContainer& dictionary;
};
} // namespace

TYPED_TEST(DictionaryTest, HasLetGoOfWhatItReleases)
{
    TypeParam dictionary;
    dictionary.takeElements();
    for (int rank = 0; rank < 3; rank++)
        dictionary.add(new Item(rank), new Curious(dictionary));
    Curious::found = 0;
    const Item first(0);
    EXPECT_TRUE(dictionary.remove(const_cast<Item*>(&first)));
    EXPECT_EQ(Curious::found, 2);
    dictionary.removeAll();
    EXPECT_EQ(Curious::found, 2);
}

TYPED_TEST(DictionaryTest, OwnsItsAssociationsInEveryMode)
{
    Item key(1), object(2), otherKey(3);
    {
        TypeParam shared;
        EXPECT_TRUE(shared.add(&key, &object));
        auto* ready = new CmAssociation(&otherKey, &object);
        ready->addRef();
        EXPECT_TRUE(shared.add(ready));
        EXPECT_TRUE(shared.remove(&otherKey));
        EXPECT_EQ(ready->release(), 0u);
    }
    EXPECT_EQ(key.getRefCount(), 1u);

    // In mode 2 key and object get no reference and still lose one.
    TypeParam retaining;
    retaining.retainElements();
    key.addRef();
    object.addRef();
    EXPECT_TRUE(retaining.add(&key, &object));
    EXPECT_EQ(retaining.lookupAssoc(&key)->getRefCount(), 1u);
    EXPECT_EQ(key.getRefCount(), 2u);
    EXPECT_TRUE(retaining.remove(&key));
    EXPECT_EQ(key.getRefCount(), 1u);
    EXPECT_EQ(object.getRefCount(), 1u);
}

TYPED_TEST(DictionaryTest, CopiesHaveTheirOwnAssociations)
{
    TypeParam owning;
    fill(owning, 3);
    const Item key(2);
    {
        TypeParam copied(owning);
        EXPECT_NE(copied.lookup(&key), owning.lookup(&key));
        EXPECT_EQ(rankOf(copied.lookup(&key)), 20);
        copied = owning;
        EXPECT_EQ(copied.total(), 3);
        EXPECT_FALSE(copied.addAllFrom(&owning)) << "the keys are present";
        EXPECT_EQ(Item::alive, 13) << "refused copies must go";
    }
    for (int16 mode : {CmContainer::kShared, CmContainer::kRetained})
    {
        TypeParam copied;
        owning.setOwnership(mode);
        copied.copy(owning);
        owning.takeElements();
        EXPECT_EQ(copied.lookup(&key), owning.lookup(&key));
        EXPECT_NE(copied.lookupAssoc(&key), owning.lookupAssoc(&key));
    }
    EXPECT_EQ(rankOf(owning.lookup(&key)), 20);
}

TYPED_TEST(DictionaryTest, APairStandsInSeveralDictionaries)
{
    Item key(1), object(10), otherKey(2);
    auto first = std::make_unique<TypeParam>();
    ASSERT_TRUE(first->add(&key, &object));
    CmAssociation* pair = first->lookupAssoc(&key);
    pair->addRef();

    TypeParam second;
    pair->addRef();
    ASSERT_TRUE(second.add(pair));
    ASSERT_TRUE(second.add(&otherKey, &object));
    ASSERT_TRUE(first->remove(&key));
    EXPECT_EQ(second.lookupAssoc(&key), pair);

    // It is put back, and taken out with the table.
    pair->addRef();
    ASSERT_TRUE(first->add(pair));
    EXPECT_EQ(first->lookupObject(&key), &object);
    first.reset();
    EXPECT_EQ(second.lookupAssoc(&key), pair);
    ASSERT_TRUE(second.remove(&key));
    EXPECT_EQ(pair->getRefCount(), 1u);
    EXPECT_EQ(pair->getKey(), &key);
    EXPECT_TRUE(pair->isA("CmAssociation"));
    pair->release();
}

TEST(CmBTreeDictionary, IsReadInOrderOfKeys)
{
    CmBTreeDictionary dictionary(3);
    dictionary.takeElements();
    for (int rank : {5, 2, 9, 1, 7})
        dictionary.add(new Item(rank), new Item(rank));
    std::string order;
    for (auto it = iterate(dictionary); !it->done();)
        order += std::to_string(rankOf(static_cast<CmAssociation*>(it->next())->getKey()));
    EXPECT_EQ(order, "12579");
}

TEST(CmDictionary, FindsTheFirstKeyOfAnObject)
{
    CmDictionary dictionary;
    dictionary.takeElements();
    for (int rank : {4, 5, 6})
        dictionary.add(new Item(rank), new Item(rank / 5));
    const Item one(1), nine(9);
    EXPECT_EQ(rankOf(dictionary.lookupKey(&one)), 5);
    EXPECT_EQ(dictionary.lookupKey(&nine), nullptr);
    EXPECT_EQ(dictionary.lookupKey(nullptr), nullptr);
}

TEST(CmHashDictionary, GrowsForNewKeysAlone)
{
    CmHashDictionary dictionary(10);
    dictionary.setAutoResize(true);
    fill(dictionary, 20);
    Item present(7), object(1), added(20);
    EXPECT_FALSE(dictionary.add(&present, &object));
    EXPECT_EQ(dictionary.size(), 10) << "a refused pair must not change the order";
    dictionary.shareElements();
    EXPECT_TRUE(dictionary.add(&added, &object));
    EXPECT_EQ(dictionary.size(), 100);
    EXPECT_EQ(dictionary.lookup(&added), &object);
    EXPECT_TRUE(dictionary.remove(&added));
    dictionary.takeElements();
}

namespace
{
/// A pair that takes any key for its own.
class OpenPair : public CmAssociation
{
    DECLARE_COPYABLE(OpenPair, CmAssociation)

    using CmAssociation::CmAssociation;
    bool isEqual(const CmObject*) const override { return true; }
};

unsigned lastBucket(const CmObject* pair, unsigned size)
{
    const CmAssociation* association = FCast(CmAssociation, pair);
    return association && association->getKey() ? size - 1 : 0;
}
} // namespace

TEST(CmHashDictionary, AsksPairsThatHaveAnEqualityOfTheirOwn)
{
    CmHashDictionary dictionary(1);
    Item key(1), other(2), object(3);
    ASSERT_TRUE(dictionary.add(&key, &object));
    ASSERT_TRUE(dictionary.add(new OpenPair(&other, &other)));
    const Item unknown(7);
    EXPECT_EQ(dictionary.lookup(&key), &object);
    EXPECT_EQ(dictionary.lookup(&unknown), &other);
    ASSERT_TRUE(dictionary.remove(const_cast<Item*>(&unknown)));
    EXPECT_FALSE(dictionary.contains(&unknown));
    EXPECT_TRUE(dictionary.remove(&key));
    EXPECT_TRUE(dictionary.isEmpty());
}

TEST(CmHashDictionary, GivesPairsToItsHashFunction)
{
    CmHashDictionary dictionary(4);
    dictionary.setHashFunction(lastBucket);
    Item first(8), second(5), absent(2), object(3);
    ASSERT_TRUE(dictionary.add(&first, &object));
    ASSERT_TRUE(dictionary.add(&second, &object));
    EXPECT_TRUE(dictionary.contains(&first));
    EXPECT_FALSE(dictionary.contains(&absent));
    const auto it = iterate(dictionary);
    EXPECT_EQ(static_cast<CmAssociation*>(it->next())->getKey(), &first) << "both are in the last bucket";
    EXPECT_TRUE(dictionary.remove(&first));
    EXPECT_FALSE(dictionary.remove(&absent));
    EXPECT_EQ(dictionary.total(), 1);
}

TEST(CmHashDictionary, KeepsItsChainsWhole)
{
    CmHashDictionary dictionary(1), other(1);
    Item keys[] = {Item(0), Item(1), Item(2), Item(3)}, object(9);
    for (Item& key : keys)
        ASSERT_TRUE(dictionary.add(&key, &object));
    CmAssociation* shared = dictionary.lookupAssoc(&keys[0]);
    shared->addRef();
    ASSERT_TRUE(other.add(shared));
    EXPECT_TRUE(dictionary.contains(&keys[3])) << "the place in the first chain is still taken";
    dictionary.lookupAssoc(&keys[1])->setKey(nullptr);
    EXPECT_FALSE(dictionary.contains(&keys[1]));
    ASSERT_TRUE(dictionary.remove(&keys[2]));
    ASSERT_TRUE(dictionary.remove(&keys[3]));
    ASSERT_TRUE(dictionary.add(&keys[3], &object));
    EXPECT_TRUE(dictionary.contains(&keys[0]));
    EXPECT_EQ(dictionary.at(2), dictionary.lookupAssoc(&keys[3]));
    EXPECT_EQ(dictionary.total(), 3);
}

TEST(CmHashDictionary, HoldsNothingWithoutBuckets)
{
    CmHashDictionary dictionary(0);
    Item key(1), object(2);
    EXPECT_FALSE(dictionary.add(&key, &object));
    EXPECT_FALSE(dictionary.contains(&key));
    EXPECT_FALSE(dictionary.remove(&key));
}
