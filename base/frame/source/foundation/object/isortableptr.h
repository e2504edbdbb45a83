#pragma once

#include "foundation/object/iptr.h"

/// An IPtr that TOrderedArray keeps in the order of `comparer`, which gives less than, equal to or more than 0. One
/// thread at a time.
template <class T, int (*comparer)(const T* left, const T* right)>
class ISortablePtr : public IPtr<T>
{
public:
    using IPtr<T>::IPtr;
    ISortablePtr(const IPtr<T>& pointer) : IPtr<T>(pointer) {}

    bool operator<(const ISortablePtr& other) const { return comparer(this->get(), other.get()) < 0; }
    bool operator==(const ISortablePtr& other) const { return this->get() == other.get(); }
};
