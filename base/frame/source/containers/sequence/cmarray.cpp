#include "containers/sequence/cmarray.h"

#include <algorithm>
#include <utility>

DEFINE_CLASS(CmArray, CmContainer)

bool CmArray::insertAt(int index, CmObject* object)
{
    if (!object || index < 0 || index > _total || !makeRoom())
        return false;
    insert(index, object);
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
    return behindEqual(object, bisect(object, from, to));
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
    if (merged > _size && (_delta == 0 || !reallocate(merged)))
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
