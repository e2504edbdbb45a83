#include "containers/keyed/cmhashtable.h"

#include <climits>
#include <cstdlib>
#include <utility>

DEFINE_CLASS(CmHashTable, CmContainer)

namespace
{
constexpr int kGrowthFactor = 10;
constexpr int kCrowdedChain = 2;

CmHashBucket* makeBuckets(int size)
{
    return static_cast<CmHashBucket*>(calloc(static_cast<size_t>(size), sizeof(CmHashBucket)));
}

void append(CmHashBucket& bucket, CmHashNode* node)
{
    node->next = nullptr;
    (bucket.last ? bucket.last->next : bucket.first) = node;
    bucket.last = node;
    bucket.count++;
}

CmHashNode* findEqual(CmHashNode* node, const CmObject* object)
{
    while (node && !node->object->isEqual(object))
        node = node->next;
    return node;
}
} // namespace

CmHashTable::CmHashTable(int size)
{
    if (size > 0)
        resize(size);
}

CmHashTable::CmHashTable(const SettingsOf& settings) : CmHashTable(settings.other._size)
{
    _autoResize = settings.other._autoResize;
    _hashFunction = settings.other._hashFunction;
}

CmHashTable::CmHashTable(const CmHashTable& other) : CmHashTable(SettingsOf{other})
{
    CmContainer::copy(other);
}

CmHashTable::~CmHashTable()
{
    CmHashTable::removeAll();
    free(_buckets);
}

bool CmHashTable::resize(int newSize)
{
    CmHashBucket* buckets = newSize > 0 ? makeBuckets(newSize) : nullptr;
    if (!buckets)
        return false;
    _total = 0;
    for (int i = 0; i < _size; i++)
        for (CmHashNode* node = _buckets[i].first; node;)
        {
            CmHashNode* moved = std::exchange(node, node->next);
            append(buckets[bucketNumber(moved->object, newSize)], moved);
            _total++;
        }
    free(std::exchange(_buckets, buckets));
    _size = newSize;
    return true;
}

bool CmHashTable::add(CmObject* object)
{
    if (!object || _size == 0)
        return false;
    growIfCrowded();
    return addTo(*bucketOf(object), object);
}

bool CmHashTable::addUnique(CmObject* object)
{
    if (!object || _size == 0)
        return false;
    CmHashBucket* bucket = bucketOf(object);
    if (findEqual(bucket->first, object))
        return false;
    if (growIfCrowded())
        bucket = bucketOf(object);
    return addTo(*bucket, object);
}

bool CmHashTable::growIfCrowded()
{
    return _autoResize && _total / _size >= kCrowdedChain && _size <= INT_MAX / kGrowthFactor &&
           resize(_size * kGrowthFactor);
}

bool CmHashTable::addTo(CmHashBucket& bucket, CmObject* object)
{
    CmHashNode* node = makeNode(object);
    if (!node)
        return false;
    append(bucket, node);
    _total++;
    testRemember(object);
    return true;
}

bool CmHashTable::remove(CmObject* object)
{
    CmObject* removed = takeEqual(object);
    testDelete(removed);
    return removed != nullptr;
}

CmObject* CmHashTable::takeEqual(const CmObject* object)
{
    if (!object || _size == 0)
        return nullptr;
    CmHashBucket& bucket = *bucketOf(object);
    CmHashNode* predecessor = nullptr;
    for (CmHashNode* node = bucket.first; node; predecessor = node, node = node->next)
        if (node->object->isEqual(object))
            return take(bucket, predecessor, node);
    return nullptr;
}

bool CmHashTable::remove(const CmIterator& position)
{
    if (!position.walksOver(this) || position.done())
        return false;
    const auto& cursor = static_cast<const CmHashTableIterator&>(position);
    CmHashBucket& bucket = _buckets[cursor.bucket];
    CmHashNode* node = cursor.node;
    CmHashNode* predecessor = bucket.first == node ? nullptr : bucket.first;
    while (predecessor && predecessor->next != node)
        predecessor = predecessor->next;
    cursor.advance();
    testDelete(take(bucket, predecessor, node));
    return true;
}

bool CmHashTable::removeAt(int index)
{
    if (index < 0)
        return false;
    CmHashTableIterator position(*this);
    position += index;
    return CmHashTable::remove(position);
}

void CmHashTable::removeAll()
{
    for (int i = 0; i < _size; i++)
        while (CmHashNode* node = _buckets[i].first)
            testDelete(take(_buckets[i], nullptr, node));
}

CmObject* CmHashTable::lookup(const CmObject* object) const
{
    const CmHashNode* node = find(object);
    return node ? node->object : nullptr;
}

bool CmHashTable::containsAbs(const CmObject* object) const
{
    if (!object || _size == 0)
        return false;
    const CmHashNode* node = bucketOf(object)->first;
    while (node && node->object != object)
        node = node->next;
    return node != nullptr;
}

int CmHashTable::occurrences(const CmObject* object) const
{
    int count = 0;
    for (const CmHashNode* node = find(object); node; node = node->next)
        if (node->object->isEqual(object))
            count++;
    return count;
}

CmIterator* CmHashTable::newIterator() const
{
    return new CmHashTableIterator(*this);
}

CmHashNode* CmHashTable::find(const CmObject* object) const
{
    if (!object || _size == 0)
        return nullptr;
    return findEqual(bucketOf(object)->first, object);
}

CmHashBucket* CmHashTable::bucketOf(const CmObject* object) const
{
    return &_buckets[bucketNumber(object, _size)];
}

unsigned CmHashTable::bucketNumber(const CmObject* object, int size) const
{
    const unsigned count = static_cast<unsigned>(size);
    return _hashFunction ? _hashFunction(object, count) : object->hash(count);
}

CmObject* CmHashTable::take(CmHashBucket& bucket, CmHashNode* predecessor, CmHashNode* node)
{
    unlink(bucket, predecessor, node);
    CmObject* object = node->object;
    dropNode(node);
    return object;
}

CmHashTableIterator::CmHashTableIterator(const CmHashTable& walked) : CmIterator(&walked), table(walked)
{
    seekForward();
}

CmObject* CmHashTableIterator::next()
{
    CmObject* left = current();
    if (node)
        advance();
    return left;
}

CmObject* CmHashTableIterator::previous()
{
    const CmHashNode* left = node;
    if (!left)
        return nullptr;
    CmHashNode* before = table._buckets[bucket].first;
    if (before == left)
    {
        bucket--;
        seekBackward();
        return left->object;
    }
    while (before->next != left)
        before = before->next;
    node = before;
    return left->object;
}

CmObject* CmHashTableIterator::first()
{
    bucket = 0;
    seekForward();
    return current();
}

CmObject* CmHashTableIterator::last()
{
    bucket = table._size - 1;
    seekBackward();
    return current();
}

void CmHashTableIterator::advance() const
{
    node = node->next;
    if (node)
        return;
    bucket++;
    seekForward();
}

void CmHashTableIterator::seekForward() const
{
    while (bucket < table._size && !table._buckets[bucket].first)
        bucket++;
    node = bucket < table._size ? table._buckets[bucket].first : nullptr;
}

void CmHashTableIterator::seekBackward() const
{
    while (bucket >= 0 && !table._buckets[bucket].first)
        bucket--;
    node = bucket >= 0 ? table._buckets[bucket].last : nullptr;
}
