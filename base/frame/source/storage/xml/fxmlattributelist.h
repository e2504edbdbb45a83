#pragma once

#include "containers/sequence/cmarray.h"
#include "storage/xml/fxmlattribute.h"

/// The attributes of one tag, or those that wait to be used again. It holds no references, as any array at first. One
/// thread at a time.
class FXmlAttributeList : public CmArray
{
    DECLARE_TYPE(FXmlAttributeList, CmArray)

    FXmlAttributeList() : CmArray(0, 10) {}

    /// As `add`, of what isn't null.
    bool put(FXmlAttribute* attribute)
    {
        if (!makeRoom())
            return false;
        _objects[_total++] = attribute;
        return true;
    }
    /// Hands its elements to `other`, the last one first. False, with nothing done, where there is no memory.
    bool giveAllTo(FXmlAttributeList& other)
    {
        if (other._size - other._total < _total && !other.setPlaces(other._total + _total))
            return false;
        CmObject** place = other._objects + other._total;
        for (int i = _total; i > 0; i--)
            *place++ = _objects[i - 1];
        other._total += _total;
        _total = 0;
        return true;
    }
    /// Null where there is none.
    FXmlAttribute* takeLast() { return _total > 0 ? attributeAt(--_total) : nullptr; }
    /// `index` must be that of an attribute.
    FXmlAttribute* attributeAt(int index) const { return static_cast<FXmlAttribute*>(_objects[index]); }
};
