#include "containers/sequence/cmarray.h"

#include "containers/sequence/cmarrayiterator.h"
#include "containers/sequence/objectplaces.h"

#include <algorithm>
#include <utility>

DEFINE_CLASS(CmArray, CmContainer)

CmArray::CmArray(int size, int delta) : _delta(delta)
{
    if (size > 0)
        ObjectPlaces::resize(_objects, _size, size);
}

CmArray::CmArray(const CmArray& other) : CmContainer(other), _delta(other._delta)
{
    ObjectPlaces::resize(_objects, _size, other._size);
    CmContainer::copy(other);
}

CmArray::CmArray(const CmContainer& other) : CmArray(other.total())
{
    CmContainer::copy(other);
}

CmArray& CmArray::operator=(const CmArray& other)
{
    return *this = static_cast<const CmContainer&>(other);
}

CmArray& CmArray::operator=(const CmContainer& other)
{
    if (&other == this)
        return *this;
    removeAll();
    copy(other);
    return *this;
}

CmArray::~CmArray()
{
    CmArray::removeAll();
    ObjectPlaces::resize(_objects, _size, 0);
}

bool CmArray::add(CmObject* object)
{
    return insertAt(_total, object);
}

bool CmArray::remove(CmObject* object)
{
    return removeAt(indexAbs(object));
}

bool CmArray::remove(const CmIterator& position)
{
    return removeAt(index(position));
}

bool CmArray::removeAt(int index)
{
    if (!isIndex(index))
        return false;
    // The element is out before it is released: its destructor may look at this array.
    testDelete(ObjectPlaces::take(_objects, _total, index));
    return true;
}

void CmArray::removeAll()
{
    while (_total > 0)
        testDelete(ObjectPlaces::take(_objects, _total, _total - 1));
}

CmObject* CmArray::lookup(const CmObject* object) const
{
    return at(index(object));
}

bool CmArray::contains(const CmObject* object) const
{
    return index(object) >= 0;
}

bool CmArray::containsAbs(const CmObject* object) const
{
    return indexAbs(object) >= 0;
}

int CmArray::occurrences(const CmObject* object) const
{
    int count = 0;
    for (int i = 0; object && i < _total; i++)
        if (_objects[i]->isEqual(object))
            count++;
    return count;
}

int CmArray::getIndex(const CmObject* object) const
{
    return index(object);
}

CmIterator* CmArray::newIterator() const
{
    return new CmArrayIterator(this, _objects, _total);
}

int CmArray::index(const CmObject* object) const
{
    for (int i = 0; object && i < _total; i++)
        if (_objects[i]->isEqual(object))
            return i;
    return -1;
}

int CmArray::index(const CmIterator& position) const
{
    if (!position.walksOver(this) || position.done())
        return -1;
    return static_cast<const CmArrayIterator&>(position).index();
}

int CmArray::indexAbs(const CmObject* object) const
{
    return ObjectPlaces::indexAbs(_objects, _total, object);
}

bool CmArray::insertAt(int index, CmObject* object)
{
    if (!object || index < 0 || index > _total)
        return false;
    if (!ObjectPlaces::makeRoom(_objects, _size, _total, _delta))
        return false;
    ObjectPlaces::insert(_objects, _total, index, object);
    testRemember(object);
    return true;
}

bool CmArray::replaceAt(int index, CmObject* object)
{
    if (!object || !isIndex(index))
        return false;
    // An object that takes its own place must not be released for it.
    CmObject* replaced = std::exchange(_objects[index], object);
    if (replaced == object)
        return true;
    testRemember(object);
    testDelete(replaced);
    return true;
}

bool CmArray::swap(int first, int second)
{
    if (!isIndex(first) || !isIndex(second))
        return false;
    std::swap(_objects[first], _objects[second]);
    return true;
}

bool CmArray::addSorted(CmObject* object)
{
    return insertAt(_total == 0 ? 0 : shouldGo(object, 0, -1), object);
}

int CmArray::shouldGo(const CmObject* object, int from, int to) const
{
    if (!object)
        return -1;
    if (_total == 0)
        return 0;
    if (to < 1 || to >= _total)
        to = _total - 1;
    from = std::clamp(from, 0, _total);
    if (object->compare(_objects[to]) >= 0)
        return _total;
    if (from == 0 && object->compare(_objects[0]) <= 0)
        return 0;
    const int place = ObjectPlaces::bisect(_objects, object, from, to);
    return ObjectPlaces::behindEqual(_objects, _total, object, place);
}

bool CmArray::mergeSorted(CmArray& other)
{
    if (&other == this)
    {
        CmArray elements(_total);
        elements.takeAllFrom(this, false);
        return mergeSorted(elements);
    }
    const int merged = _total + other._total;
    if (merged > _size && (_delta == 0 || !ObjectPlaces::resize(_objects, _size, merged)))
        return false;

    // From the end, so that nothing is moved twice.
    int mine = _total - 1;
    int others = other._total - 1;
    for (int place = merged - 1; others >= 0; place--)
    {
        if (mine >= 0 && _objects[mine]->compare(other._objects[others]) > 0)
        {
            _objects[place] = _objects[mine--];
            continue;
        }
        CmObject* element = other._objects[others--];
        _objects[place] = _ownsObjects == kTaken ? element->newCopy() : element;
        testRemember(element);
    }
    _total = merged;
    return true;
}

void CmArray::quickSort()
{
    ObjectPlaces::sort(_objects, _total);
}

bool CmArray::resize(int newSize)
{
    while (_total > std::max(newSize, 0))
        removeAt(_total - 1);
    return ObjectPlaces::resize(_objects, _size, std::max(newSize, 0));
}
