#pragma once

#include "foundation/object/cmobject.h"

class CmArray;
class CmIterator;
class CmObjectFilter;
class FStream;

/// The contract of the object containers: elements are compared by `isEqual` and `compare`, and ownership is a mode.
///
/// | mode         | `add`                              | removal, destruction | copying                               |
/// |--------------|------------------------------------|----------------------|---------------------------------------|
/// | 0 kShared    | stores the pointer                 | nothing              | shares the pointers                   |
/// | 1 kTaken     | takes over the caller's reference  | `release`            | `newCopy` of each element             |
/// | 2 kRetained  | adds a reference of its own        | `release`            | shares the pointers, a reference each |
///
/// The mode is 0 at first and may be set at any time. Elements are never null. Nothing throws or reports: a failure
/// is false, -1 or null. Containers have no locks: one thread at a time.
class CmContainer : public CmObject
{
    DECLARE_ABSTRACT_CLASS(CmContainer, CmObject)

    enum Ownership : int16
    {
        kShared = 0,
        kTaken = 1,
        kRetained = 2
    };

    CmContainer() = default;
    /// Copies no elements: the concrete classes follow with `copy`.
    CmContainer(const CmContainer& other) : CmObject(other) {}
    /// The concrete classes assign by `assign`.
    CmContainer& operator=(const CmContainer&) = delete;

    // Operations, in their slot order

    /// Capacity of an array, buckets of a hash table; else the number of elements.
    virtual int size() const { return _size; }
    virtual int total() const { return _size; }
    virtual bool isEmpty() const { return total() == 0; }
    /// False for null, or where the container takes no more. The reference then stays with the caller.
    virtual bool add(CmObject* object) = 0;
    virtual bool remove(CmObject* object) = 0;
    /// Removes the element under the cursor, which then stands on the next one. The only way to remove while
    /// iterating. False for an iterator that is done or walks over another container.
    virtual bool remove(const CmIterator& position) = 0;
    virtual bool removeAt(int index) = 0;
    virtual void removeAll() = 0;
    /// Borrowed; null out of range.
    virtual CmObject* at(int index) const;
    /// The first stored element equal to `object`, borrowed.
    virtual CmObject* lookup(const CmObject* object) const;
    virtual bool contains(const CmObject* object) const;
    /// Whether this very object is stored.
    virtual bool containsAbs(const CmObject* object) const;
    virtual int occurrences(const CmObject* object) const;
    virtual int getIndex(const CmObject* object) const;
    /// The caller deletes the iterator.
    virtual CmIterator* newIterator() const = 0;
    /// Takes over the mode of `source` and adds its elements as the mode says. What is here stays.
    virtual void copy(const CmContainer& source);

    CmObject* operator[](int index) const { return at(index); }

    // Ownership

    int16 getOwnership() const { return _ownsObjects; }
    void setOwnership(int16 mode) { _ownsObjects = mode; }
    /// Mode 0.
    void shareElements() { setOwnership(kShared); }
    /// Mode 1.
    void takeElements() { setOwnership(kTaken); }
    /// Mode 2.
    void retainElements() { setOwnership(kRetained); }

    // From and to other containers

    /// In mode 1 adds a copy of each element, else the pointers.
    bool addAllFrom(const CmContainer* other);
    /// Adds the pointers. Each element gets one more reference with `retain`, else none, whatever the mode.
    bool takeAllFrom(const CmContainer* other, bool retain);
    /// Removes each element of the other container by `remove`.
    void removeAllFrom(const CmContainer* other);
    /// A new array of all elements equal to `object`, which shares them; the caller releases it.
    CmArray* lookupAll(const CmObject* object) const;

    // Through a filter

    /// Adds to `result` what passes; whether anything did.
    bool query(CmObjectFilter& filter, CmContainer& result) const;
    CmObject* firstThat(CmObjectFilter& filter) const;
    CmObject* lastThat(CmObjectFilter& filter) const;
    /// Asks the filter about the elements in order until one doesn't pass; whether all did.
    bool forEach(CmObjectFilter& filter) const;
    /// As `forEach` in contiguous stretches on several threads at once; `threads` below 1 takes all processors.
    ///
    /// Beware of the result: on one thread true says that all passed, on several it says that one did not. With
    /// fewer than `minPerThread` elements a thread, fewer threads run. Read the outcome from the filter.
    bool concurrentIteration(CmObjectFilter& filter, int threads, int minPerThread) const;

    // Storage

    /// The mode alone, as 16 bits.
    bool readBase(FStream& stream);
    bool writeBase(FStream& stream) const;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;

protected:
    /// Called by every insertion: adds a reference in mode 2.
    void testRemember(CmObject* object) const
    {
        if (object && _ownsObjects == kRetained)
            object->addRef();
    }
    /// Called by every removal that doesn't hand the element back: releases it in modes 1 and 2.
    void testDelete(CmObject* object) const
    {
        if (object && (_ownsObjects == kTaken || _ownsObjects == kRetained))
            object->release();
    }
    /// What `operator=` of a concrete class does: removes all of `target`, then follows `copy`.
    template <class Container>
    static Container& assign(Container& target, const CmContainer& source);
    /// Adds an element of another container, or a copy of it, as the mode says.
    virtual bool addFromOther(CmObject* element);
    /// Adds an element that was restored from a file, and takes over the reference on it in any case.
    virtual bool addRestored(CmObject* element);

    int32 _size = 0;
    int16 _ownsObjects = kShared;
};

template <class Container>
Container& CmContainer::assign(Container& target, const CmContainer& source)
{
    if (&source == &target)
        return target;
    target.removeAll();
    target.copy(source);
    return target;
}
