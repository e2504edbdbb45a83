#pragma once

#include "containers/sequence/cmcontainer.h"
#include "containers/sequence/cmiterator.h"

#include <new>

/// A place in a chain of a CmHashTable.
struct CmHashNode
{
    FPOOLED_OBJECTS

    CmHashNode* next;
    CmObject* object;
};

/// A bucket of a CmHashTable: a chain in the order of insertion.
struct CmHashBucket
{
    int count;
    CmHashNode* first;
    CmHashNode* last;
};

/// Chained hash table of objects, by their `hash` and `isEqual`. Duplicates are allowed.
///
/// The order of iteration is that of the buckets, and in each the order of insertion; it changes with the number of
/// buckets. That number stays unless auto-resize is set: then it grows tenfold once the chains are two long on
/// average. One thread at a time.
class CmHashTable : public CmContainer
{
    DECLARE_CLASS(CmHashTable, CmContainer)

    /// Gives a bucket number below `size`.
    using HashFunction = unsigned (*)(const CmObject* object, unsigned size);

    /// Without buckets every `add` is refused.
    explicit CmHashTable(int size = 10);
    CmHashTable(const CmHashTable& other);
    CmHashTable& operator=(const CmHashTable& other) { return assign(*this, other); }
    ~CmHashTable() override;

    /// Null stands for the `hash` of the elements. Only an empty table may change it.
    void setHashFunction(HashFunction function) { _hashFunction = function; }
    void setAutoResize(bool state) { _autoResize = state; }
    /// Sets the number of buckets. False for none or without memory; the table is then as it was.
    bool resize(int newSize);

    int total() const override { return _total; }
    bool add(CmObject* object) override;
    bool remove(CmObject* object) override;
    bool remove(const CmIterator& position) override;
    bool removeAt(int index) override;
    /// The buckets stay.
    void removeAll() override;
    CmObject* lookup(const CmObject* object) const override;
    bool contains(const CmObject* object) const override { return find(object) != nullptr; }
    bool containsAbs(const CmObject* object) const override;
    int occurrences(const CmObject* object) const override;
    CmIterator* newIterator() const override;

protected:
    /// An empty table with the settings of `other`, which a derived class then copies.
    struct SettingsOf
    {
        const CmHashTable& other;
    };
    explicit CmHashTable(const SettingsOf& settings);

    CmHashNode* find(const CmObject* object) const;
    /// Adds what has no equal here.
    bool addUnique(CmObject* object);
    /// Takes out the first equal element and gives it, with its reference; null where there is none.
    CmObject* takeEqual(const CmObject* object);
    /// A node for `object`, which is going to stand in the table; null where there is no memory.
    virtual CmHashNode* makeNode(CmObject* object) { return new (std::nothrow) CmHashNode{nullptr, object}; }
    /// For a node whose object is alive, but no longer in the table.
    virtual void dropNode(CmHashNode* node) { delete node; }
    HashFunction hashFunction() const { return _hashFunction; }
    CmHashBucket& bucketAt(unsigned number) const { return _buckets[number]; }
    /// Takes `node` out of its chain, and leaves it as it is. `predecessor` is null for the first of a chain.
    void unlink(CmHashBucket& bucket, CmHashNode* predecessor, CmHashNode* node);

private:
    friend class CmHashTableIterator;

    CmHashBucket* bucketOf(const CmObject* object) const;
    unsigned bucketNumber(const CmObject* object, int size) const;
    /// Whether the number of buckets has changed.
    bool growIfCrowded();
    bool addTo(CmHashBucket& bucket, CmObject* object);
    /// As unlink, and drops the node. Gives its object, whose reference is then the caller's.
    CmObject* take(CmHashBucket& bucket, CmHashNode* predecessor, CmHashNode* node);

    bool _autoResize = false;
    int32 _total = 0;
    CmHashBucket* _buckets = nullptr;
    HashFunction _hashFunction = nullptr;
};

inline void CmHashTable::unlink(CmHashBucket& bucket, CmHashNode* predecessor, CmHashNode* node)
{
    (predecessor ? predecessor->next : bucket.first) = node->next;
    if (bucket.last == node)
        bucket.last = predecessor;
    bucket.count--;
    _total--;
}

/// Walks over a CmHashTable. Going backwards costs a walk through a chain. One thread at a time.
class CmHashTableIterator : public CmIterator
{
public:
    explicit CmHashTableIterator(const CmHashTable& walked);

    using CmIterator::next;
    using CmIterator::previous;
    bool done() const override { return !node; }
    CmObject* next() override;
    CmObject* previous() override;
    CmObject* current() const override { return node ? node->object : nullptr; }
    CmObject* first() override;
    CmObject* last() override;

private:
    friend class CmHashTable;

    void advance() const;
    void seekForward() const;
    void seekBackward() const;

    const CmHashTable& table;
    // Moved on by a removal, through an iterator that is const to its holder.
    mutable int bucket = 0;
    mutable CmHashNode* node = nullptr;
};
