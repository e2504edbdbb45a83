#pragma once

#include "foundation/object/cmobject.h"

/// An address as a key of dictionaries. What stands there isn't touched, and need not be there any more. Immutable.
class FPointer : public CmObject
{
    DECLARE_COPYABLE(FPointer, CmObject)

    explicit FPointer(const void* itsAddress) : address(itsAddress) {}

    bool isEqual(const CmObject* other) const override;
    /// By the addresses; -1 with anything else.
    int compare(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;

private:
    const void* address;
};
