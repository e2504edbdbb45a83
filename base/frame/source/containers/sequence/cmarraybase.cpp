#include "containers/sequence/cmarraybase.h"

#include "containers/sequence/cmarrayiterator.h"

#include <algorithm>
#include <bit>
#include <climits>
#include <cstdlib>
#include <cstring>

namespace
{
bool cmpObjs(const CmObject* left, const CmObject* right)
{
    return left->compare(right) < 0;
}

/// The places that are asked of the system: up to a quarter more than `places`, so that an array with a small step
/// isn't moved at each of them.
int roomFor(int places)
{
    // A multiple of a quarter of the power of two below.
    const unsigned wanted = static_cast<unsigned>(places);
    const unsigned step = std::max(std::bit_floor(wanted) / 4, 1u);
    const unsigned rounded = (wanted + step - 1) & ~(step - 1);
    return static_cast<int>(std::min(rounded, static_cast<unsigned>(INT_MAX)));
}

void move(CmObject** to, CmObject* const* from, int count)
{
    memmove(to, from, static_cast<size_t>(count) * sizeof *to);
}
} // namespace

CmArrayBase::CmArrayBase(int size, int delta) : _delta(delta)
{
    if (size > 0)
        reallocate(size);
}

CmArrayBase::~CmArrayBase()
{
    CmArrayBase::removeAll();
    free(_objects);
}

bool CmArrayBase::removeAt(int index)
{
    if (!isIndex(index))
        return false;
    // The element is out before it is released: its destructor may look at this array.
    testDelete(take(index));
    return true;
}

void CmArrayBase::removeAll()
{
    while (_total > 0)
        testDelete(take(_total - 1));
}

int CmArrayBase::occurrences(const CmObject* object) const
{
    int count = 0;
    for (int i = 0; object && i < _total; i++)
        if (_objects[i]->isEqual(object))
            count++;
    return count;
}

CmIterator* CmArrayBase::newIterator() const
{
    return new CmArrayIterator(*this);
}

int CmArrayBase::indexUnder(const CmIterator& position) const
{
    if (!position.walksOver(this) || position.done())
        return -1;
    return static_cast<const CmArrayIterator&>(position).index();
}

int CmArrayBase::indexOfEqual(const CmObject* object) const
{
    for (int i = 0; object && i < _total; i++)
        if (_objects[i]->isEqual(object))
            return i;
    return -1;
}

int CmArrayBase::indexOfIdentical(const CmObject* object) const
{
    for (int i = 0; i < _total; i++)
        if (_objects[i] == object)
            return i;
    return -1;
}

bool CmArrayBase::grow()
{
    if (_delta == 0)
        return false;
    int64 newSize = int64{_size} + _delta;
    if (_delta == -1)
        newSize = _size == 0 ? 10 : int64{_size} * 2;
    return newSize > _total && newSize <= INT_MAX && reallocate(static_cast<int>(newSize));
}

void CmArrayBase::insert(int index, CmObject* object)
{
    move(_objects + index + 1, _objects + index, _total - index);
    _objects[index] = object;
    _total++;
    testRemember(object);
}

CmObject* CmArrayBase::take(int index)
{
    CmObject* object = _objects[index];
    _total--;
    move(_objects + index, _objects + index + 1, _total - index);
    _objects[_total] = nullptr;
    return object;
}

bool CmArrayBase::setPlaces(int newSize)
{
    newSize = std::max(newSize, 0);
    while (_total > newSize)
        removeAt(_total - 1);
    return reallocate(newSize);
}

bool CmArrayBase::reallocate(int newSize)
{
    if (newSize == 0)
    {
        free(_objects);
        _objects = nullptr;
        _size = 0;
        return true;
    }
    const bool hasRoom = _objects && newSize >= _size && newSize <= roomFor(_size);
    if (!hasRoom)
    {
        const size_t room = static_cast<size_t>(roomFor(newSize));
        void* places = realloc(static_cast<void*>(_objects), room * sizeof *_objects);
        if (!places)
            return false;
        _objects = static_cast<CmObject**>(places);
    }
    _size = newSize;
    return true;
}

int CmArrayBase::bisect(const CmObject* object, int low, int high) const
{
    while (low <= high)
    {
        const int middle = low + (high - low) / 2;
        const int order = object->compare(_objects[middle]);
        if (order == 0)
            return middle;
        if (order < 0)
            high = middle - 1;
        else
            low = middle + 1;
    }
    return low;
}

int CmArrayBase::behindEqual(const CmObject* object, int place) const
{
    while (place < _total && object->compare(_objects[place]) >= 0)
        place++;
    return place;
}

void CmArrayBase::sort()
{
    // Unlike std::sort, this one stays within the array where `compare` contradicts itself, as that of an
    // association without a key does.
    std::stable_sort(_objects, _objects + _total, &cmpObjs);
}
