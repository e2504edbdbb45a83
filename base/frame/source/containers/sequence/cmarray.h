#pragma once

#include "containers/sequence/cmarraybase.h"

/// The default list of objects: an array that grows by `delta` places when it is full.
///
/// A delta of 0 never grows, so that `add` then fails; -1 doubles (10 places at first). `remove` looks for the very
/// object, `index` and `lookup` for an equal one. One thread at a time.
class CmArray : public CmArrayBase
{
    DECLARE_CLASS(CmArray, CmContainer)

    explicit CmArray(int size = 0, int delta = 10) : CmArrayBase(size, delta) {}
    CmArray(const CmArray& other) : CmArrayBase(other) { CmContainer::copy(other); }
    explicit CmArray(const CmContainer& other) : CmArray(other.total()) { CmContainer::copy(other); }
    CmArray& operator=(const CmArray& other) { return assign(*this, other); }
    CmArray& operator=(const CmContainer& other) { return assign(*this, other); }

    bool add(CmObject* object) override
    {
        if (!object || !makeRoom())
            return false;
        append(object);
        return true;
    }
    using CmArrayBase::remove;
    bool remove(CmObject* object) override { return removeAt(indexAbs(object)); }

    /// The first equal element; -1 where there is none.
    int index(const CmObject* object) const override { return indexOfEqual(object); }
    /// The index under a cursor over this array; -1 when it is done.
    virtual int index(const CmIterator& position) const { return indexUnder(position); }
    virtual int indexAbs(const CmObject* object) const { return indexOfIdentical(object); }
    virtual bool insertAt(int index, CmObject* object);
    virtual bool replaceAt(int index, CmObject* object);
    virtual bool swap(int first, int second);
    /// Keeps an array sorted that is: equal elements stand in the order of insertion.
    virtual bool addSorted(CmObject* object);
    /// Where `object` belongs in the sorted stretch `from` to `to`, behind equal elements; -1 for null. A `to` below
    /// 1 or beyond the elements means the last one.
    virtual int shouldGo(const CmObject* object, int from, int to) const;
    /// Merges another sorted array into this sorted one: copies in mode 1, else the pointers.
    virtual bool mergeSorted(CmArray& other);
    /// Sorts by `compare`; the order of equal elements is left open.
    virtual void quickSort() { sort(); }
    /// Sets the number of places; surplus elements are removed. False only without memory.
    virtual bool resize(int newSize) { return setPlaces(newSize); }
};
