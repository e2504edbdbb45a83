#pragma once

#include "storage/attribute/fattrlist.h"

#include <vector>

/// What the queues of numbers have in common; no class of the object model. One thread at a time.
template <class T>
class TNumberList : public FAttrList
{
public:
    void queue(T value) { values.push_back(value); }
    /// False at the end, with `value` untouched.
    bool unqueue(T& value);
    T at(int index) const { return values[static_cast<unsigned>(index)]; }

    int total() const override { return static_cast<int>(values.size()); }
    bool unqueueVariant(FVariant& value) override;
    bool externalize(FArchive& archive) const override;
    bool internalize(FArchive& archive) override;

private:
    std::vector<T> values;
};

extern template class TNumberList<long long>;
extern template class TNumberList<double>;
