#pragma once

#include "storage/attribute/fattrlist.h"

#include <vector>

/// A queue of integers. One thread at a time.
class FIntList : public FAttrList
{
    DECLARE_CLASS(FIntList, FAttrList)

    void queue(long long value) { values.push_back(value); }
    /// False at the end, with `value` untouched.
    bool unqueue(long long& value);
    long long at(int index) const { return values[static_cast<unsigned>(index)]; }

    int total() const override { return static_cast<int>(values.size()); }
    bool unqueueVariant(FVariant& value) override;
    bool externalize(FArchive& archive) const override;
    bool internalize(FArchive& archive) override;

private:
    std::vector<long long> values;
};
