#pragma once

#include "containers/sequence/cmcontainer.h"

/// The default list of objects: an array that grows by `delta` places when it is full.
///
/// A delta of 0 never grows, so that `add` then fails; -1 doubles (10 places at first). `remove` looks for the very
/// object, `index` and `lookup` for an equal one. One thread at a time.
class CmArray : public CmContainer
{
    DECLARE_CLASS(CmArray, CmContainer)

    explicit CmArray(int size = 0, int delta = 10);
    CmArray(const CmArray& other);
    explicit CmArray(const CmContainer& other);
    CmArray& operator=(const CmArray& other);
    CmArray& operator=(const CmContainer& other);
    ~CmArray() override;

    int total() const override { return _total; }
    bool add(CmObject* object) override;
    bool remove(CmObject* object) override;
    bool remove(const CmIterator& position) override;
    /// The capacity stays, here and in `removeAll`.
    bool removeAt(int index) override;
    void removeAll() override;
    CmObject* at(int index) const override { return isIndex(index) ? _objects[index] : nullptr; }
    CmObject* lookup(const CmObject* object) const override;
    bool contains(const CmObject* object) const override;
    bool containsAbs(const CmObject* object) const override;
    int occurrences(const CmObject* object) const override;
    int getIndex(const CmObject* object) const override;
    CmIterator* newIterator() const override;

    /// The first equal element; -1 where there is none.
    virtual int index(const CmObject* object) const;
    /// The index under a cursor over this array; -1 when it is done.
    virtual int index(const CmIterator& position) const;
    virtual int indexAbs(const CmObject* object) const;
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
    virtual void quickSort();
    /// Sets the number of places; surplus elements are removed. False only without memory.
    virtual bool resize(int newSize);

private:
    bool isIndex(int index) const { return index >= 0 && index < _total; }
    void detachAt(int index);

    int32 _delta;
    int32 _total = 0;
    CmObject** _objects = nullptr;
};
