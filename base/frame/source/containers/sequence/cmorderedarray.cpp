#include "containers/sequence/cmorderedarray.h"

#include "containers/sequence/cmarrayiterator.h"
#include "containers/sequence/objectplaces.h"

#include <algorithm>

DEFINE_CLASS(CmOrderedArray, CmContainer)

namespace
{
constexpr int kLinearSearchLimit = 2;
}

CmOrderedArray::CmOrderedArray(int size, int delta) : _delta(delta)
{
    if (size > 0)
        ObjectPlaces::resize(_objects, _size, size);
}

CmOrderedArray::CmOrderedArray(const CmOrderedArray& other) : CmContainer(other), _delta(other._delta)
{
    ObjectPlaces::resize(_objects, _size, other._size);
    CmContainer::copy(other);
}

CmOrderedArray::CmOrderedArray(const CmContainer& other) : CmOrderedArray(other.total())
{
    CmContainer::copy(other);
}

CmOrderedArray& CmOrderedArray::operator=(const CmOrderedArray& other)
{
    return *this = static_cast<const CmContainer&>(other);
}

CmOrderedArray& CmOrderedArray::operator=(const CmContainer& other)
{
    if (&other == this)
        return *this;
    removeAll();
    copy(other);
    return *this;
}

CmOrderedArray::~CmOrderedArray()
{
    CmOrderedArray::removeAll();
    ObjectPlaces::resize(_objects, _size, 0);
}

bool CmOrderedArray::add(CmObject* object)
{
    if (!object || !ObjectPlaces::makeRoom(_objects, _size, _total, _delta))
        return false;
    ObjectPlaces::insert(_objects, _total, shouldGo(object), object);
    testRemember(object);
    return true;
}

bool CmOrderedArray::remove(CmObject* object)
{
    return removeAt(index(object));
}

bool CmOrderedArray::remove(const CmIterator& position)
{
    if (!position.walksOver(this) || position.done())
        return false;
    return removeAt(static_cast<const CmArrayIterator&>(position).index());
}

bool CmOrderedArray::removeAt(int index)
{
    if (!isIndex(index))
        return false;
    // The element is out before it is released: its destructor may look at this array.
    testDelete(ObjectPlaces::take(_objects, _total, index));
    return true;
}

void CmOrderedArray::removeAll()
{
    while (_total > 0)
        testDelete(ObjectPlaces::take(_objects, _total, _total - 1));
}

CmIterator* CmOrderedArray::newIterator() const
{
    return new CmArrayIterator(this, _objects, _total);
}

int CmOrderedArray::index(const CmObject* object) const
{
    if (!object)
        return -1;
    if (_total <= kLinearSearchLimit)
    {
        for (int i = 0; i < _total; i++)
            if (_objects[i]->isEqual(object))
                return i;
        return -1;
    }
    int place = ObjectPlaces::bisect(_objects, object, 0, _total - 1);
    if (place == _total || object->compare(_objects[place]) != 0)
        return -1;
    while (place > 0 && object->compare(_objects[place - 1]) == 0)
        place--;
    return place;
}

int CmOrderedArray::indexAbs(const CmObject* object) const
{
    return ObjectPlaces::indexAbs(_objects, _total, object);
}

bool CmOrderedArray::removeAbs(CmObject* object)
{
    return removeAt(indexAbs(object));
}

int CmOrderedArray::shouldGo(const CmObject* object) const
{
    if (!object || _total >= _size)
        return -1;
    if (_total == 0 || object->compare(_objects[0]) < 0)
        return 0;
    if (object->compare(_objects[_total - 1]) >= 0)
        return _total;
    const int place = ObjectPlaces::bisect(_objects, object, 0, _total - 1);
    return ObjectPlaces::behindEqual(_objects, _total, object, place);
}

void CmOrderedArray::resort()
{
    ObjectPlaces::sort(_objects, _total);
}

bool CmOrderedArray::resize(int newSize)
{
    while (_total > std::max(newSize, 0))
        removeAt(_total - 1);
    return ObjectPlaces::resize(_objects, _size, std::max(newSize, 0));
}
