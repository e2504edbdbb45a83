#pragma once

#include "containers/typed/tcontainer.h"

#include <algorithm>
#include <cstddef>
#include <cstdlib>
#include <new>
#include <type_traits>
#include <utility>

/// What the array templates share: places, growth and removal. Where a new element goes, `shouldGo` decides.
///
/// Growth when full: step 0 never grows, so `add` then fails; step -1 doubles (10 at first); any other is added.
/// One thread at a time, as all that follows here.
template <class T>
class TArrayBase : public TContainer<T>
{
public:
    explicit TArrayBase(int initialCapacity = 0, int step = 10) : growStep(step) { resize(initialCapacity); }
    TArrayBase(const TArrayBase& other) : TContainer<T>(other), growStep(other.growStep)
    {
        takeCopies(other);
    }
    TArrayBase& operator=(const TArrayBase& other);
    ~TArrayBase() override;

    int total() const override { return count; }
    int size() const override { return capacity; }
    const T& at(int index) const override { return isIndex(index) ? elements[index] : TContainer<T>::none(); }
    const T& lookup(const T& value) const override { return at(index(value)); }
    bool contains(const T& value) const override { return index(value) >= 0; }
    bool add(const T& value) override { return doInsertAt(shouldGo(value), value); }
    bool remove(const T& value) override { return removeAt(index(value)); }
    bool removeAt(int position) override;
    /// The places stay.
    void removeAll() override;
    TIterator<T>* newIterator() const override;

    /// The place at which `add` inserts.
    virtual int shouldGo(const T& value) const = 0;
    /// The first element equal to `value`; -1 where there is none.
    virtual int index(const T& value) const = 0;

    /// Inserts, whatever the order. False for an index beyond the end, or where the array is full and may not grow.
    bool doInsertAt(int position, const T& value);
    /// Sets the number of places; elements beyond it are removed. False for a negative one or without memory.
    bool resize(int newCapacity);
    /// As `index`, by bisection: for an array that is in the order of `operator<`.
    int indexSorted(const T& value) const;

    /// `position` must be that of an element.
    T& operator[](int position) { return elements[position]; }
    const T& operator[](int position) const { return elements[position]; }
    T* begin() { return elements; }
    T* end() { return elements + count; }
    const T* begin() const { return elements; }
    const T* end() const { return elements + count; }

protected:
    bool isIndex(int position) const { return position >= 0 && position < count; }

private:
    bool grow();
    bool reallocate(int newCapacity);
    void takeCopies(const TArrayBase& other);

    int capacity = 0;
    int growStep;
    int count = 0;
    T* elements = nullptr;
};

/// Walks over an array by index.
template <class T>
class TArrayIterator : public TIterator<T>
{
public:
    explicit TArrayIterator(const TArrayBase<T>& walked) : array(&walked) {}

    bool done() const override { return cursor < 0 || cursor >= array->total(); }
    const T& next() override { return array->at(done() ? cursor : cursor++); }
    const T& previous() override { return array->at(done() ? cursor : cursor--); }
    const T& current() const override { return array->at(cursor); }
    const T& first() override { return array->at(cursor = 0); }
    const T& last() override { return array->at(cursor = array->total() - 1); }

private:
    const TArrayBase<T>* array;
    int cursor = 0;
};

/// An array in the order of insertion.
template <class T>
class TArray : public TArrayBase<T>
{
public:
    using TArrayBase<T>::TArrayBase;

    int shouldGo(const T&) const override { return this->total(); }
    int index(const T& value) const override
    {
        const T* place = std::find(this->begin(), this->end(), value);
        return place == this->end() ? -1 : static_cast<int>(place - this->begin());
    }
    TContainer<T>* newInstance() const override { return new TArray; }
};

/// An array in the order of `operator<`; equal elements stand in the order of insertion.
template <class T>
class TOrderedArray : public TArrayBase<T>
{
public:
    using TArrayBase<T>::TArrayBase;

    int shouldGo(const T& value) const override
    {
        return static_cast<int>(std::upper_bound(this->begin(), this->end(), value) - this->begin());
    }
    /// The first element that sorts neither before nor after `value`.
    int index(const T& value) const override { return this->indexSorted(value); }
    int occurrences(const T& value) const override
    {
        int first = index(value);
        return first < 0 ? 0 : shouldGo(value) - first;
    }
    TContainer<T>* newInstance() const override { return new TOrderedArray; }
};

template <class T>
TArrayBase<T>& TArrayBase<T>::operator=(const TArrayBase& other)
{
    if (this == &other)
        return *this;
    removeAll();
    growStep = other.growStep;
    takeCopies(other);
    return *this;
}

template <class T>
TArrayBase<T>::~TArrayBase()
{
    std::destroy_n(elements, count);
    free(elements);
}

template <class T>
bool TArrayBase<T>::removeAt(int position)
{
    if (!isIndex(position))
        return false;
    // The element leaves before it goes: its destructor may look at this array.
    [[maybe_unused]] T removed(std::move(elements[position]));
    std::move(elements + position + 1, elements + count, elements + position);
    count--;
    std::destroy_at(elements + count);
    return true;
}

template <class T>
void TArrayBase<T>::removeAll()
{
    while (count > 0)
    {
        [[maybe_unused]] T removed(std::move(elements[--count]));
        std::destroy_at(elements + count);
    }
}

template <class T>
TIterator<T>* TArrayBase<T>::newIterator() const
{
    return new TArrayIterator<T>(*this);
}

template <class T>
bool TArrayBase<T>::doInsertAt(int position, const T& value)
{
    if (position < 0 || position > count)
        return false;
    // `value` may be an element of this very array.
    T inserted(value);
    if (count >= capacity && !grow())
        return false;
    if (position == count)
        std::construct_at(elements + count, std::move(inserted));
    else
    {
        std::construct_at(elements + count, std::move(elements[count - 1]));
        std::move_backward(elements + position, elements + count - 1, elements + count);
        elements[position] = std::move(inserted);
    }
    count++;
    return true;
}

template <class T>
bool TArrayBase<T>::resize(int newCapacity)
{
    if (newCapacity < 0)
        return false;
    while (count > newCapacity)
        removeAt(count - 1);
    return newCapacity == capacity || reallocate(newCapacity);
}

template <class T>
int TArrayBase<T>::indexSorted(const T& value) const
{
    const T* place = std::lower_bound(begin(), end(), value);
    return place == end() || value < *place ? -1 : static_cast<int>(place - begin());
}

template <class T>
bool TArrayBase<T>::grow()
{
    if (growStep == 0)
        return false;
    int newCapacity = capacity + growStep;
    if (growStep == -1)
        newCapacity = capacity == 0 ? 10 : 2 * capacity;
    return newCapacity > count && reallocate(newCapacity);
}

template <class T>
bool TArrayBase<T>::reallocate(int newCapacity)
{
    static_assert(alignof(T) <= alignof(std::max_align_t));
    const size_t bytes = static_cast<size_t>(newCapacity) * sizeof(T);
    T* places = nullptr;
    if constexpr (std::is_trivially_copyable_v<T>)
    {
        places = newCapacity == 0 ? (free(elements), nullptr)
                                  : static_cast<T*>(realloc(static_cast<void*>(elements), bytes));
        if (!places && newCapacity > 0)
            return false;
    }
    else
    {
        places = static_cast<T*>(malloc(bytes));
        if (!places && newCapacity > 0)
            return false;
        std::uninitialized_move_n(elements, count, places);
        std::destroy_n(elements, count);
        free(elements);
    }
    elements = places;
    capacity = newCapacity;
    return true;
}

template <class T>
void TArrayBase<T>::takeCopies(const TArrayBase& other)
{
    if (other.capacity > capacity && !reallocate(other.capacity))
        return;
    std::uninitialized_copy_n(other.elements, other.count, elements);
    count = other.count;
}
