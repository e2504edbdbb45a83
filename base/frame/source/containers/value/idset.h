#pragma once

#include "containers/value/bitset.h"

/// Hands out numbers, always the lowest that is free, and takes them back.
///
/// One thread at a time.
class IDSet : public BitSet
{
public:
    /// Numbers count from `first`; room for `count` of them is made at a time.
    IDSet(int first, int count);

    int newID();
    /// Numbers that were not handed out do no harm.
    void releaseID(int id);

private:
    int firstID;
    uint32 growStep;
};
