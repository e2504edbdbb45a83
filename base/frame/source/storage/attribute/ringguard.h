#pragma once

#include "foundation/object/fobject.h"

/// Finds rings that a damaged file would make: objects that hold one another are never released.
///
/// Stands around the reading of something that `holder` is to hold. If a reference to the holder was taken meanwhile,
/// what was read leads back to it, by however many objects, and must not be held. One thread at a time.
class RingGuard
{
public:
    explicit RingGuard(const FObject& itsHolder) : holder(itsHolder), before(itsHolder.getRefCount()) {}

    bool isRing() const { return holder.getRefCount() > before; }

private:
    const FObject& holder;
    const uint32 before;
};
