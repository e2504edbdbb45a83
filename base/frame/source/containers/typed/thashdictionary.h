#pragma once

#include "containers/typed/tassociation.h"
#include "containers/typed/thashtable.h"

/// A hash table of values under unique keys. `hashKey` gives a bucket number below `size`.
/// One thread at a time.
template <class Key, class Value, unsigned (*hashKey)(const Key& key, unsigned size)>
class THashDictionary
{
public:
    using Association = TAssociation<Key, Value>;

    explicit THashDictionary(int bucketCount) : table(bucketCount, &hashAssociation) {}

    int total() const { return table.total(); }
    bool isEmpty() const { return table.isEmpty(); }
    /// False where the key is present already; its value stays.
    bool add(const Key& key, const Value& value) { return !contains(key) && table.add({key, value}); }
    bool contains(const Key& key) const { return lookup(key) != nullptr; }
    /// The value under `key`, borrowed; null where there is none.
    Value* lookup(const Key& key) const
    {
        Association* found = table.find({key, Value{}});
        return found ? &found->value : nullptr;
    }
    bool remove(const Key& key) { return table.remove({key, Value{}}); }
    void removeAll() { table.removeAll(); }
    /// Walks over the associations.
    THashTableIterator<Association> iterate() const { return THashTableIterator<Association>(table); }

private:
    static unsigned hashAssociation(const Association& association, unsigned size)
    {
        return hashKey(association.key, size);
    }

    THashTable<Association> table;
};
