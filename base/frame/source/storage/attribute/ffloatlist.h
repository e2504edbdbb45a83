#pragma once

#include "storage/attribute/fattrlist.h"

#include <vector>

/// A queue of doubles. One thread at a time.
class FFloatList : public FAttrList
{
    DECLARE_CLASS(FFloatList, FAttrList)

    void queue(double value) { values.push_back(value); }
    /// False at the end, with `value` untouched.
    bool unqueue(double& value);
    double at(int index) const { return values[static_cast<unsigned>(index)]; }

    int total() const override { return static_cast<int>(values.size()); }
    bool unqueueVariant(FVariant& value) override;
    bool externalize(FArchive& archive) const override;
    bool internalize(FArchive& archive) override;

private:
    std::vector<double> values;
};
