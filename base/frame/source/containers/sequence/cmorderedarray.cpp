#include "containers/sequence/cmorderedarray.h"

DEFINE_CLASS(CmOrderedArray, CmContainer)

namespace
{
constexpr int kLinearSearchLimit = 2;
}

bool CmOrderedArray::add(CmObject* object)
{
    if (!object || !makeRoom())
        return false;
    insert(shouldGo(object), object);
    return true;
}

int CmOrderedArray::index(const CmObject* object) const
{
    if (!object || _total <= kLinearSearchLimit)
        return indexOfEqual(object);
    int place = bisect(object, 0, _total - 1);
    if (place == _total || object->compare(_objects[place]) != 0)
        return -1;
    while (place > 0 && object->compare(_objects[place - 1]) == 0)
        place--;
    return place;
}

int CmOrderedArray::shouldGo(const CmObject* object) const
{
    if (!object || _total >= _size)
        return -1;
    if (_total == 0 || object->compare(_objects[0]) < 0)
        return 0;
    if (object->compare(_objects[_total - 1]) >= 0)
        return _total;
    return behindEqual(object, bisect(object, 0, _total - 1));
}
