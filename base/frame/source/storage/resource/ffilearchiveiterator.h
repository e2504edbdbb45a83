#pragma once

#include "foundation/object/iptr.h"
#include "storage/filesystem/ffileiterator.h"
#include "storage/resource/ffilearchivenode.h"

#include <vector>

class FFileArchive;

/// A walk over the children of a node or, recursively, all below it, each folder before what is in it. It keeps the
/// archive, which must stay open. One thread at a time.
class FFileArchiveIterator : public FFileIterator
{
    DECLARE_TYPE(FFileArchiveIterator, FFileIterator)

    FFileArchiveIterator(FFileArchive* itsArchive, const FFileArchiveNode* itsFolder, bool isRecursive);
    ~FFileArchiveIterator() override;

    void first() override;
    void next() override;
    bool done() override { return places.empty(); }
    IPtr<FPath> current() override;
    /// Borrowed; null at the end.
    const FFileArchiveNode* currentNode() const;

private:
    struct Place
    {
        const FFileArchiveNode* folder;
        std::size_t index;
    };

    void settle();

    IPtr<FFileArchive> archive;
    IPtr<FFileArchiveNode> folder;
    bool recursive;
    std::vector<Place> places;
};
