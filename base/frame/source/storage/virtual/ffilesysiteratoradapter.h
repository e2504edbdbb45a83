#pragma once

#include "foundation/object/iptr.h"
#include "storage/filesystem/ffileiterator.h"
#include "storage/virtual/ivirtualfilesystem.h"

/// A component's walk as one of the framework. One thread at a time.
class FFileSysIteratorAdapter : public FFileIterator
{
    DECLARE_TYPE(FFileSysIteratorAdapter, FFileIterator)

    /// Adds a reference.
    explicit FFileSysIteratorAdapter(IVirtualFileIterator* itsWalk) : FFileIterator(nullptr), walk(itsWalk) {}

    void first() override { walk->first(); }
    void next() override { walk->next(); }
    bool done() override { return walk->done(); }
    IPtr<FPath> current() override;

private:
    IPtr<IVirtualFileIterator> walk;
};
