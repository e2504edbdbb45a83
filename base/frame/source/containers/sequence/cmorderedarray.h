#pragma once

#include "containers/sequence/cmarraybase.h"

/// An array of objects that stays sorted by `compare`; equal ones stand in the order of insertion.
///
/// Growth is that of CmArray. After elements have changed their order, call `resort`. One thread at a time.
class CmOrderedArray : public CmArrayBase
{
    DECLARE_CLASS(CmOrderedArray, CmContainer)

    explicit CmOrderedArray(int size = 0, int delta = 10) : CmArrayBase(size, delta) {}
    CmOrderedArray(const CmOrderedArray& other) : CmArrayBase(other) { CmContainer::copy(other); }
    explicit CmOrderedArray(const CmContainer& other) : CmOrderedArray(other.total())
    {
        CmContainer::copy(other);
    }
    CmOrderedArray& operator=(const CmOrderedArray& other) { return assign(*this, other); }
    CmOrderedArray& operator=(const CmContainer& other) { return assign(*this, other); }

    bool add(CmObject* object) override;
    using CmArrayBase::remove;
    /// Removes the first element of equal rank.
    bool remove(CmObject* object) override { return removeAt(index(object)); }

    /// The first element of equal rank, whether or not `isEqual` holds for it; up to two elements are compared by
    /// `isEqual` instead. -1 where there is none.
    int index(const CmObject* object) const override;
    virtual int indexAbs(const CmObject* object) const { return indexOfIdentical(object); }
    /// Removes this very object.
    virtual bool removeAbs(CmObject* object) { return removeAt(indexAbs(object)); }
    /// The place behind equal elements; -1 when the array is full or for null.
    virtual int shouldGo(const CmObject* object) const;
    virtual void resort() { sort(); }
    /// As that of CmArray.
    virtual bool resize(int newSize) { return setPlaces(newSize); }
};
