#pragma once

#include "foundation/object/iptr.h"
#include "foundation/text/fstring.h"
#include "storage/filesystem/ffileiterator.h"

class FUrl;

/// A walk over paths inside an archive that gives them as URLs of it. One thread at a time.
class FFileIteratorUrlWrapper : public FFileIterator
{
    DECLARE_TYPE(FFileIteratorUrlWrapper, FFileIterator)

    /// Takes over `inner`; `base` is any URL of the archive.
    FFileIteratorUrlWrapper(FFileIterator* inner, const FUrl& base);

    void first() override { walk->first(); }
    void next() override { walk->next(); }
    bool done() override { return walk->done(); }
    IPtr<FPath> current() override;

private:
    IPtr<FFileIterator> walk;
    FString protocol;
    FString host;
};
