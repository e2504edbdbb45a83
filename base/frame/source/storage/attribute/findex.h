#pragma once

#include "foundation/object/cmobject.h"

/// The number by which an archive knows a class or an object. Immutable.
class FIndex : public CmObject
{
    DECLARE_COPYABLE(FIndex, CmObject)

    explicit FIndex(uint32 itsNumber) : number(itsNumber) {}

    uint32 getNumber() const { return number; }

private:
    uint32 number;
};
