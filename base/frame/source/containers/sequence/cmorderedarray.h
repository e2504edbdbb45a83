#pragma once

#include "containers/sequence/cmcontainer.h"

/// An array of objects that stays sorted by `compare`; equal ones stand in the order of insertion.
///
/// Growth is that of CmArray. After elements have changed their order, call `resort`. One thread at a time.
class CmOrderedArray : public CmContainer
{
    DECLARE_CLASS(CmOrderedArray, CmContainer)

    explicit CmOrderedArray(int size = 0, int delta = 10);
    CmOrderedArray(const CmOrderedArray& other);
    explicit CmOrderedArray(const CmContainer& other);
    CmOrderedArray& operator=(const CmOrderedArray& other);
    CmOrderedArray& operator=(const CmContainer& other);
    ~CmOrderedArray() override;

    int total() const override { return _total; }
    bool add(CmObject* object) override;
    /// Removes the first element of equal rank.
    bool remove(CmObject* object) override;
    bool remove(const CmIterator& position) override;
    bool removeAt(int index) override;
    void removeAll() override;
    CmObject* at(int index) const override { return isIndex(index) ? _objects[index] : nullptr; }
    CmObject* lookup(const CmObject* object) const override { return at(index(object)); }
    bool contains(const CmObject* object) const override { return index(object) >= 0; }
    int getIndex(const CmObject* object) const override { return index(object); }
    CmIterator* newIterator() const override;

    /// The first element of equal rank, whether or not `isEqual` holds for it; up to two elements are compared by
    /// `isEqual` instead. -1 where there is none.
    virtual int index(const CmObject* object) const;
    virtual int indexAbs(const CmObject* object) const;
    /// Removes this very object.
    virtual bool removeAbs(CmObject* object);
    /// The place behind equal elements; -1 when the array is full or for null.
    virtual int shouldGo(const CmObject* object) const;
    virtual void resort();
    virtual bool resize(int newSize);

private:
    bool isIndex(int index) const { return index >= 0 && index < _total; }
    void detachAt(int index);

    int32 _delta;
    int32 _total = 0;
    CmObject** _objects = nullptr;
};
