// Containers of objects beside those of plain C++ and Qt.
//
// Sizes count elements. Keys are 16-bit texts "Item 0123456" in shuffled order, and numbers for the B-tree; all are
// made beforehand, and what is looked for is equal to what is stored, but not the same. All containers hold
// references. The tables are made for their number of elements, but for those that grow, which begin small: ours with
// one and a half times as many buckets, a prime, where Qt takes at least twice as many. The B-tree has the default
// order. A case's time is that for all elements, but for the removals from the middle of an array, which are a hundred.

#include "containers/keyed/cmbtree.h"
#include "containers/keyed/cmhashdictionary.h"
#include "containers/sequence/cmarray.h"
#include "containers/sequence/cmarrayiterator.h"
#include "foundation/object/iptr.h"
#include "foundation/text/cmstring.h"

#include <benchmark/benchmark.h>

#include <QtCore/QHash>
#include <QtCore/QSet>
#include <QtCore/QString>
#include <algorithm>
#include <map>
#include <memory>
#include <random>
#include <string>
#include <vector>

namespace
{
constexpr int kRemovals = 100;

/// An object that sorts by a number.
class Number : public CmObject
{
public:
    explicit Number(int itsValue) : value(itsValue) {}
    int compare(const CmObject* other) const override
    {
        const int others = static_cast<const Number*>(other)->value;
        return value < others ? -1 : value > others;
    }

    int value;
};

/// The numbers from `first` on, shuffled: the same in every run, and others for each seed.
std::vector<int> shuffled(int64_t count, unsigned seed, int first = 0)
{
    std::vector<int> numbers(static_cast<size_t>(count));
    for (int& number : numbers)
        number = first++;
    std::shuffle(numbers.begin(), numbers.end(), std::mt19937(seed));
    return numbers;
}

std::u16string nameOf(int number)
{
    const std::string digits = std::to_string(10000000 + number);
    return u"Item " + std::u16string(digits.begin() + 1, digits.end());
}

template <class Key>
Key makeKey(int number)
{
    if constexpr (std::is_same_v<Key, IPtr<CmString>>)
        return adopt(new CmString(nameOf(number).c_str()));
    else if constexpr (std::is_same_v<Key, IPtr<Number>>)
        return adopt(new Number(number));
    else if constexpr (std::is_same_v<Key, QString>)
        return QString::fromStdU16String(nameOf(number));
    else if constexpr (std::is_same_v<Key, std::u16string>)
        return nameOf(number);
    else
        return number;
}

/// What is stored, what is looked for, and what isn't there.
template <class Key>
struct Keys
{
    explicit Keys(int count)
        : stored(make(shuffled(count, 1))),
          wanted(make(shuffled(count, 2))),
          absent(make(shuffled(count, 3, count)))
    {
    }

    /// Made once and kept.
    static const Keys& of(const benchmark::State& state)
    {
        static std::map<int64_t, Keys> kept;
        return kept.try_emplace(state.range(0), static_cast<int>(state.range(0))).first->second;
    }

    static std::vector<Key> make(const std::vector<int>& numbers)
    {
        std::vector<Key> keys;
        keys.reserve(numbers.size());
        for (const int number : numbers)
            keys.push_back(makeKey<Key>(number));
        return keys;
    }

    std::vector<Key> stored;
    std::vector<Key> wanted;
    std::vector<Key> absent;
};

// Arrays

struct OurArray
{
    OurArray() { array.retainElements(); }
    void append(Number* number) { array.add(number); }
    void removeMiddle() { array.removeAt(array.total() / 2); }
    int64 sum() const
    {
        int64 result = 0;
        for (CmArrayIterator it(array); !it.done();)
            result += static_cast<Number*>(it.next())->value;
        return result;
    }

    CmArray array;
};

struct StdArray
{
    void append(Number* number) { array.emplace_back(number); }
    void removeMiddle() { array.erase(array.begin() + static_cast<ptrdiff_t>(array.size() / 2)); }
    int64 sum() const
    {
        int64 result = 0;
        for (const IPtr<Number>& number : array)
            result += number->value;
        return result;
    }

    std::vector<IPtr<Number>> array;
};

template <class Array>
void fillArray(Array& array, const benchmark::State& state)
{
    for (const IPtr<Number>& number : Keys<IPtr<Number>>::of(state).stored)
        array.append(number);
}

template <class Array>
void append(benchmark::State& state)
{
    Keys<IPtr<Number>>::of(state);
    for (auto _ : state)
    {
        auto array = std::make_unique<Array>();
        fillArray(*array, state);
        state.PauseTiming();
        array.reset();
        state.ResumeTiming();
    }
}

template <class Container>
void iterateFilled(benchmark::State& state, const Container& container)
{
    const int64 expected = state.range(0) * (state.range(0) - 1) / 2;
    for (auto _ : state)
        if (container.sum() != expected)
            state.SkipWithError("elements are missing");
}

template <class Array>
void iterate(benchmark::State& state)
{
    Array array;
    fillArray(array, state);
    iterateFilled(state, array);
}

template <class Array>
void removeMiddle(benchmark::State& state)
{
    for (auto _ : state)
    {
        state.PauseTiming();
        auto array = std::make_unique<Array>();
        fillArray(*array, state);
        state.ResumeTiming();
        for (int i = 0; i < kRemovals; i++)
            array->removeMiddle();
        state.PauseTiming();
        array.reset();
        state.ResumeTiming();
    }
}

// Keyed containers: each has a `Key` to add, find and remove by, and is made for a number of elements

/// The next prime after one and a half times `count`.
int bucketsFor(int64_t count)
{
    return count == 1000 ? 1511 : count == 10000 ? 15013 : 1500007;
}

struct OurTable
{
    using Key = IPtr<CmString>;
    explicit OurTable(int64_t count) : table(bucketsFor(count)) { table.retainElements(); }
    bool add(const Key& key) { return table.add(key); }
    bool contains(const Key& key) const { return table.contains(key); }
    bool remove(const Key& key) { return table.remove(key); }

    CmHashTable table;
};

struct OurGrowingTable : OurTable
{
    explicit OurGrowingTable(int64_t count) : OurTable(count)
    {
        table.resize(10);
        table.setAutoResize(true);
    }
};

struct QtTable
{
    using Key = QString;
    explicit QtTable(int64_t count) { table.reserve(count); }
    bool add(const Key& key) { return table.insert(key) != table.end(); }
    bool contains(const Key& key) const { return table.contains(key); }
    bool remove(const Key& key) { return table.remove(key); }

    QSet<QString> table;
};

struct QtGrowingTable : QtTable
{
    explicit QtGrowingTable(int64_t) : QtTable(0) {}
};

/// What all keys of a dictionary lead to.
Number* theValue()
{
    static const auto value = adopt(new Number(1));
    return value;
}

struct OurDictionary
{
    using Key = IPtr<CmString>;
    explicit OurDictionary(int64_t count) : table(bucketsFor(count)) { table.takeElements(); }
    bool add(const Key& key)
    {
        // The dictionary takes over a reference on each.
        key->addRef();
        theValue()->addRef();
        return table.add(key, theValue());
    }
    bool contains(const Key& key) const { return table.lookupObject(key) != nullptr; }
    bool remove(const Key& key) { return table.remove(key); }

    CmHashDictionary table;
};

struct QtDictionary
{
    using Key = QString;
    explicit QtDictionary(int64_t count) { table.reserve(count); }
    bool add(const Key& key) { return table.insert(key, theValue()) != table.end(); }
    bool contains(const Key& key) const { return table.value(key) != nullptr; }
    bool remove(const Key& key) { return table.remove(key); }

    QHash<QString, IPtr<Number>> table;
};

template <class OurKey>
struct OurTree
{
    using Key = OurKey;
    explicit OurTree(int64_t) { tree.retainElements(); }
    bool add(const Key& key) { return tree.add(key); }
    bool contains(const Key& key) const { return tree.lookup(key) != nullptr; }
    bool remove(const Key& key) { return tree.remove(key); }
    int64 sum() const
    {
        int64 result = 0;
        for (CmBTreeIterator it(tree); !it.done();)
            result += static_cast<Number*>(it.next())->value;
        return result;
    }

    CmBTree tree;
};

template <class PeerKey>
struct StdTree
{
    using Key = PeerKey;
    explicit StdTree(int64_t) {}
    bool add(const Key& key) { return tree.try_emplace(key, theValue()).second; }
    bool contains(const Key& key) const { return tree.find(key) != tree.end(); }
    bool remove(const Key& key) { return tree.erase(key) > 0; }
    int64 sum() const
    {
        int64 result = 0;
        for (const auto& [key, value] : tree)
            result += key;
        return result;
    }

    std::map<Key, IPtr<Number>> tree;
};

template <class Table>
const Keys<typename Table::Key>& keysOf(const benchmark::State& state)
{
    return Keys<typename Table::Key>::of(state);
}

template <class Table>
void fill(Table& table, const benchmark::State& state)
{
    for (const auto& key : keysOf<Table>(state).stored)
        table.add(key);
}

template <class Table>
void insert(benchmark::State& state)
{
    keysOf<Table>(state);
    for (auto _ : state)
    {
        auto table = std::make_unique<Table>(state.range(0));
        fill(*table, state);
        state.PauseTiming();
        table.reset();
        state.ResumeTiming();
    }
}

template <class Table, bool isThere>
void find(benchmark::State& state)
{
    Table table(state.range(0));
    fill(table, state);
    const auto& keys = isThere ? keysOf<Table>(state).wanted : keysOf<Table>(state).absent;
    for (auto _ : state)
        for (const auto& key : keys)
            if (table.contains(key) != isThere)
                state.SkipWithError("found what isn't there, or didn't find");
}

template <class Table>
void removeAll(benchmark::State& state)
{
    const auto& keys = keysOf<Table>(state).wanted;
    for (auto _ : state)
    {
        state.PauseTiming();
        auto table = std::make_unique<Table>(state.range(0));
        fill(*table, state);
        state.ResumeTiming();
        for (const auto& key : keys)
            if (!table->remove(key))
                state.SkipWithError("not removed");
        state.PauseTiming();
        table.reset();
        state.ResumeTiming();
    }
}

template <class Tree>
void iterateTree(benchmark::State& state)
{
    Tree tree(state.range(0));
    fill(tree, state);
    iterateFilled(state, tree);
}
} // namespace

#define CASE(function, name) BENCHMARK(function)->Name(name)->Unit(benchmark::kMicrosecond)->MinTime(0.1)
#define ARRAY_CASE(function, name) CASE(function, name)->Arg(10000)->Arg(1000000)
#define HASH_CASE(function, name) CASE(function, name)->Arg(1000)->Arg(10000)->Arg(1000000)
#define TREE_CASE(function, name) CASE(function, name)->Arg(10000)->Arg(1000000)

ARRAY_CASE(append<OurArray>, "object array, append/ours");
ARRAY_CASE(append<StdArray>, "object array, append/std::vector");
ARRAY_CASE(iterate<OurArray>, "object array, iterate/ours");
ARRAY_CASE(iterate<StdArray>, "object array, iterate/std::vector");
ARRAY_CASE(removeMiddle<OurArray>, "object array, remove in the middle/ours");
ARRAY_CASE(removeMiddle<StdArray>, "object array, remove in the middle/std::vector");

#define HASH_CASES(subject, Ours, Peer, peer)                                                                \
    HASH_CASE(insert<Ours>, subject ", insert/ours");                                                        \
    HASH_CASE(insert<Peer>, subject ", insert/" peer);                                                       \
    HASH_CASE((find<Ours, true>), subject ", hit/ours");                                                     \
    HASH_CASE((find<Peer, true>), subject ", hit/" peer);                                                    \
    HASH_CASE((find<Ours, false>), subject ", miss/ours");                                                   \
    HASH_CASE((find<Peer, false>), subject ", miss/" peer);                                                  \
    HASH_CASE(removeAll<Ours>, subject ", remove/ours");                                                     \
    HASH_CASE(removeAll<Peer>, subject ", remove/" peer)

HASH_CASES("hash table", OurTable, QtTable, "QSet");
HASH_CASES("hash table that grows", OurGrowingTable, QtGrowingTable, "QSet");
HASH_CASES("dictionary", OurDictionary, QtDictionary, "QHash");

#define TREE_CASES(subject, Ours, Peer)                                                                      \
    TREE_CASE(insert<Ours>, subject ", insert/ours");                                                        \
    TREE_CASE(insert<Peer>, subject ", insert/std::map");                                                    \
    TREE_CASE((find<Ours, true>), subject ", hit/ours");                                                     \
    TREE_CASE((find<Peer, true>), subject ", hit/std::map");                                                 \
    TREE_CASE(removeAll<Ours>, subject ", remove/ours");                                                     \
    TREE_CASE(removeAll<Peer>, subject ", remove/std::map")

TREE_CASES("B-tree of texts", OurTree<IPtr<CmString>>, StdTree<std::u16string>);
TREE_CASES("B-tree of numbers", OurTree<IPtr<Number>>, StdTree<int>);
TREE_CASE(iterateTree<OurTree<IPtr<Number>>>, "B-tree of numbers, iterate/ours");
TREE_CASE(iterateTree<StdTree<int>>, "B-tree of numbers, iterate/std::map");
