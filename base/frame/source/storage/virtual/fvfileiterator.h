#pragma once

#include "storage/filesystem/ffileiterator.h"
#include "storage/virtual/fvfilesystem.h"

/// A walk over a mounted file system: that of its target, with each path as one of the mounted. One thread at a time.
class FVFileIterator : public FFileIterator
{
    DECLARE_TYPE(FVFileIterator, FFileIterator)

    /// Takes over `targetWalk`; adds a reference to `mounted`.
    FVFileIterator(FVFileSystem* mounted, FFileIterator* targetWalk);

    void first() override { walk->first(); }
    void next() override { walk->next(); }
    bool done() override { return walk->done(); }
    IPtr<FPath> current() override;

private:
    IPtr<FVFileSystem> files;
    IPtr<FFileIterator> walk;
};
