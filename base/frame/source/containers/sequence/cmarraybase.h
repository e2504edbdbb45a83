#pragma once

#include "containers/sequence/cmcontainer.h"

/// What CmArray and CmOrderedArray share: places, growth, search by `index`, and removal.
///
/// It stands between CmContainer and them, and is no class of the object model. `_size` places are there, the first
/// `_total` of them in use. One thread at a time.
class CmArrayBase : public CmContainer
{
public:
    ~CmArrayBase() override;

    int total() const override { return _total; }
    bool remove(const CmIterator& position) override { return removeAt(indexUnder(position)); }
    /// The capacity stays, here and in `removeAll`.
    bool removeAt(int index) override;
    void removeAll() override;
    CmObject* at(int index) const override { return isIndex(index) ? _objects[index] : nullptr; }
    CmObject* lookup(const CmObject* object) const override { return at(index(object)); }
    bool contains(const CmObject* object) const override { return index(object) >= 0; }
    bool containsAbs(const CmObject* object) const override { return indexOfIdentical(object) >= 0; }
    int occurrences(const CmObject* object) const override;
    int getIndex(const CmObject* object) const override { return index(object); }
    CmIterator* newIterator() const override;

    virtual int index(const CmObject* object) const = 0;

protected:
    CmArrayBase(int size, int delta);
    /// Empty, with the places and the step of `other`.
    CmArrayBase(const CmArrayBase& other) : CmArrayBase(other._size, other._delta) {}

    bool isIndex(int index) const { return index >= 0 && index < _total; }
    /// The index under a cursor over this array; -1 when it is done.
    int indexUnder(const CmIterator& position) const;
    int indexOfEqual(const CmObject* object) const;
    int indexOfIdentical(const CmObject* object) const;
    /// Grows a full array by its step: 0 never, -1 doubles, any other is added. Whether there is a free place.
    bool makeRoom() { return _total < _size || grow(); }
    /// There must be a free place.
    void insert(int index, CmObject* object);
    void append(CmObject* object)
    {
        _objects[_total++] = object;
        testRemember(object);
    }
    /// Removes what stands beyond `newSize`, and sets the number of places. False only without memory.
    bool setPlaces(int newSize);
    /// Keeps the elements, so there must be a place for each. False only without memory.
    bool reallocate(int newSize);
    /// A place of rank equal to `object` between `low` and `high`, else the one where it belongs.
    int bisect(const CmObject* object, int low, int high) const;
    /// From `place` on, the first one behind what sorts before or with `object`.
    int behindEqual(const CmObject* object, int place) const;
    void sort();

    int32 _delta;
    int32 _total = 0;
    CmObject** _objects = nullptr;

private:
    friend class CmArrayIterator;

    bool grow();
    CmObject* take(int index);
};
