#pragma once

#include "containers/typed/tarray.h"
#include "containers/typed/tassociation.h"

/// Values under keys in the order of insertion, searched one by one: for a few of them.
///
/// As an array it allows a key twice; `set` and `addUnique` do not. The first one counts in a search.
/// One thread at a time.
template <class Key, class Value>
class TAssociationArray : public TArray<TAssociation<Key, Value>>
{
public:
    using Association = TAssociation<Key, Value>;
    using TArray<Association>::TArray;
    using TArray<Association>::add;
    using TArray<Association>::contains;
    using TArray<Association>::lookup;

    bool add(const Key& key, const Value& value) { return add(Association{key, value}); }
    /// False where the key is present already; its value stays.
    bool addUnique(const Key& key, const Value& value) { return !containsKey(key) && add(key, value); }
    /// Replaces the value of a present key.
    bool set(const Key& key, const Value& value)
    {
        Value* present = lookupKey(key);
        if (!present)
            return add(key, value);
        *present = value;
        return true;
    }
    bool containsKey(const Key& key) const { return indexOfKey(key) >= 0; }
    /// The value under `key`, borrowed; null where there is none.
    Value* lookupKey(const Key& key)
    {
        int place = indexOfKey(key);
        return place < 0 ? nullptr : &(*this)[place].value;
    }
    const Value* lookupKey(const Key& key) const
    {
        int place = indexOfKey(key);
        return place < 0 ? nullptr : &(*this)[place].value;
    }
    bool removeKey(const Key& key) { return this->removeAt(indexOfKey(key)); }
    int indexOfKey(const Key& key) const
    {
        for (int i = 0; i < this->total(); i++)
            if ((*this)[i].key == key)
                return i;
        return -1;
    }
    TContainer<Association>* newInstance() const override { return new TAssociationArray; }
};
