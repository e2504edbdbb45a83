#pragma once

#include "containers/typed/tcontainer.h"

#include <utility>

/// A bucket of a THashTable: a chain in the order of insertion.
template <class T>
struct THashBucket
{
    struct Node
    {
        Node* next;
        T value;
    };

    int count = 0;
    Node* first = nullptr;
    Node* last = nullptr;
};

template <class T>
class THashTableIterator;

/// Chained hash table of values with a fixed number of buckets; the chains grow without bound.
///
/// The order of iteration is that of the buckets, and in each the order of insertion. Duplicates are allowed.
/// One thread at a time.
template <class T>
class THashTable : public TContainer<T>
{
public:
    /// Gives a bucket number below `size`.
    using HashFunction = unsigned (*)(const T& value, unsigned size);

    /// Without a hash function, `add` refuses and nothing is found.
    THashTable(int bucketCount, HashFunction function)
        : hashFunction(function),
          bucketTotal(bucketCount > 0 ? bucketCount : 0),
          buckets(new THashBucket<T>[static_cast<size_t>(bucketTotal)])
    {
    }
    THashTable(const THashTable& other) : THashTable(other.bucketTotal, other.hashFunction) { addAll(other); }
    THashTable& operator=(THashTable other) noexcept;
    ~THashTable() override { THashTable::removeAll(); }

    int total() const override { return count; }
    /// The number of buckets.
    int size() const override { return bucketTotal; }
    const T& lookup(const T& value) const override;
    bool contains(const T& value) const override { return find(value) != nullptr; }
    int occurrences(const T& value) const override;
    bool add(const T& value) override;
    bool remove(const T& value) override;
    bool removeAt(int index) override;
    void removeAll() override;
    TIterator<T>* newIterator() const override { return new THashTableIterator<T>(*this); }
    TContainer<T>* newInstance() const override { return new THashTable(bucketTotal, hashFunction); }

    /// The first stored element equal to `value`, to be changed in place but for what its hash and equality look
    /// at; null where there is none.
    T* find(const T& value) const;
    /// Removes the element under the cursor, which moves on to the next one.
    bool remove(THashTableIterator<T>& position);

private:
    friend class THashTableIterator<T>;
    using Node = typename THashBucket<T>::Node;

    THashBucket<T>* bucketOf(const T& value) const;
    bool unlink(THashBucket<T>& bucket, Node* node);
    void addAll(const THashTable& other);

    HashFunction hashFunction;
    int bucketTotal;
    int count = 0;
    std::unique_ptr<THashBucket<T>[]> buckets;
};

/// Walks over a THashTable. Going backwards costs a walk through a chain.
template <class T>
class THashTableIterator : public TIterator<T>
{
public:
    explicit THashTableIterator(const THashTable<T>& walked) : table(&walked) { THashTableIterator::first(); }

    bool done() const override { return !node; }
    const T& next() override;
    const T& previous() override;
    const T& current() const override { return valueOf(node); }
    const T& first() override;
    const T& last() override;

private:
    friend class THashTable<T>;
    using Node = typename THashBucket<T>::Node;

    static const T& valueOf(const Node* place) { return place ? place->value : TContainer<T>::none(); }
    void seekForward();
    void seekBackward();

    const THashTable<T>* table;
    int bucket = 0;
    Node* node = nullptr;
};

template <class T>
THashTable<T>& THashTable<T>::operator=(THashTable other) noexcept
{
    std::swap(hashFunction, other.hashFunction);
    std::swap(bucketTotal, other.bucketTotal);
    std::swap(count, other.count);
    std::swap(buckets, other.buckets);
    return *this;
}

template <class T>
const T& THashTable<T>::lookup(const T& value) const
{
    const T* found = find(value);
    return found ? *found : TContainer<T>::none();
}

template <class T>
int THashTable<T>::occurrences(const T& value) const
{
    int result = 0;
    if (const THashBucket<T>* bucket = bucketOf(value))
        for (const Node* node = bucket->first; node; node = node->next)
            if (node->value == value)
                result++;
    return result;
}

template <class T>
bool THashTable<T>::add(const T& value)
{
    THashBucket<T>* bucket = bucketOf(value);
    if (!bucket)
        return false;
    Node* node = new Node{nullptr, value};
    (bucket->last ? bucket->last->next : bucket->first) = node;
    bucket->last = node;
    bucket->count++;
    count++;
    return true;
}

template <class T>
bool THashTable<T>::remove(const T& value)
{
    if (THashBucket<T>* bucket = bucketOf(value))
        for (Node* node = bucket->first; node; node = node->next)
            if (node->value == value)
                return unlink(*bucket, node);
    return false;
}

template <class T>
bool THashTable<T>::removeAt(int index)
{
    if (index < 0)
        return false;
    THashTableIterator<T> position(*this);
    while (index-- > 0)
        position.next();
    return remove(position);
}

template <class T>
void THashTable<T>::removeAll()
{
    for (int i = 0; i < bucketTotal; i++)
        while (buckets[static_cast<size_t>(i)].first)
            unlink(buckets[static_cast<size_t>(i)], buckets[static_cast<size_t>(i)].first);
}

template <class T>
T* THashTable<T>::find(const T& value) const
{
    if (const THashBucket<T>* bucket = bucketOf(value))
        for (Node* node = bucket->first; node; node = node->next)
            if (node->value == value)
                return &node->value;
    return nullptr;
}

template <class T>
bool THashTable<T>::remove(THashTableIterator<T>& position)
{
    Node* node = position.node;
    if (!node)
        return false;
    THashBucket<T>& bucket = buckets[static_cast<size_t>(position.bucket)];
    position.next();
    return unlink(bucket, node);
}

template <class T>
THashBucket<T>* THashTable<T>::bucketOf(const T& value) const
{
    if (!hashFunction || bucketTotal == 0)
        return nullptr;
    return &buckets[hashFunction(value, static_cast<unsigned>(bucketTotal))];
}

template <class T>
bool THashTable<T>::unlink(THashBucket<T>& bucket, Node* node)
{
    Node* predecessor = bucket.first == node ? nullptr : bucket.first;
    while (predecessor && predecessor->next != node)
        predecessor = predecessor->next;
    (predecessor ? predecessor->next : bucket.first) = node->next;
    if (bucket.last == node)
        bucket.last = predecessor;
    bucket.count--;
    count--;
    delete node;
    return true;
}

template <class T>
void THashTable<T>::addAll(const THashTable& other)
{
    for (THashTableIterator<T> it(other); !it.done();)
        add(it.next());
}

template <class T>
const T& THashTableIterator<T>::next()
{
    const Node* left = node;
    if (node)
    {
        node = node->next;
        if (!node)
        {
            bucket++;
            seekForward();
        }
    }
    return valueOf(left);
}

template <class T>
const T& THashTableIterator<T>::previous()
{
    const Node* left = node;
    if (!left)
        return valueOf(left);
    Node* before = table->buckets[static_cast<size_t>(bucket)].first;
    if (before == left)
    {
        bucket--;
        seekBackward();
        return valueOf(left);
    }
    while (before->next != left)
        before = before->next;
    node = before;
    return valueOf(left);
}

template <class T>
const T& THashTableIterator<T>::first()
{
    bucket = 0;
    seekForward();
    return current();
}

template <class T>
const T& THashTableIterator<T>::last()
{
    bucket = table->bucketTotal - 1;
    seekBackward();
    return current();
}

template <class T>
void THashTableIterator<T>::seekForward()
{
    node = nullptr;
    for (; bucket < table->bucketTotal && !node; bucket++)
        node = table->buckets[static_cast<size_t>(bucket)].first;
    if (node)
        bucket--;
}

template <class T>
void THashTableIterator<T>::seekBackward()
{
    node = nullptr;
    for (; bucket >= 0 && !node; bucket--)
        node = table->buckets[static_cast<size_t>(bucket)].last;
    if (node)
        bucket++;
}
