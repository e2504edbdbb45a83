#pragma once

#include "foundation/object/iptr.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/fattrlist.h"

#include <vector>

/// A queue of attribute trees, each with a reference of the queue's. A copy has its own trees.
/// One thread at a time.
class FSubList : public FAttrList
{
    DECLARE_CLASS(FSubList, FAttrList)

    FSubList() = default;
    FSubList(const FSubList& other);
    FSubList& operator=(const FSubList&) = delete;

    /// With `takeOver` gets the caller's reference.
    void queue(FAttributes* attributes, bool takeOver);
    /// The next tree, borrowed; null at the end.
    FAttributes* unqueue();
    /// Borrowed.
    FAttributes* at(int index) const { return trees[static_cast<unsigned>(index)]; }

    int total() const override { return static_cast<int>(trees.size()); }
    bool unqueueVariant(FVariant& value) override;
    bool externalize(FArchive& archive) const override;
    bool internalize(FArchive& archive) override;

private:
    std::vector<IPtr<FAttributes>> trees;
};
