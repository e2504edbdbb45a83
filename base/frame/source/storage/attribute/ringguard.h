#pragma once

#include "foundation/object/fobject.h"

/// Finds rings that a damaged file would make: objects that hold one another are never released.
///
/// Stands around the reading of all that `holder` is to hold, and is asked about each object when that is read. While
/// the holder has more references than at first, the object may lead back to it, by however many others, and must not
/// be held. A refused object that goes at once spoils nothing; one that lives on in the archive, with its reference to
/// the holder, spoils all that follow, for they may lead to it. One thread at a time.
class RingGuard
{
public:
    explicit RingGuard(const FObject& itsHolder) : holder(itsHolder), before(itsHolder.getRefCount()) {}

    bool isRing() const { return holder.getRefCount() > before; }

private:
    const FObject& holder;
    const uint32 before;
};
