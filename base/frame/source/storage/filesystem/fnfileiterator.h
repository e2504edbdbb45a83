#pragma once

#include "storage/filesystem/ffileiterator.h"
#include "storage/path/fnpath.h"

#include <string>
#include <vector>

/// Walks one folder on disk. The entries are read by `first`, so that files may be made and removed on the
/// way. One thread at a time.
class FNFileIterator : public IFileIteratorImpl
{
public:
    /// With `skipHidden`, entries that are hidden and packages are left out. A folder that can't be read is
    /// empty.
    explicit FNFileIterator(const FNPath* folder, bool skipHiddenEntries = false);

    void first() override;
    void next() override;
    bool done() override;
    /// An FNPath. A link is one, wherever it leads.
    IPtr<FPath> current() override;

private:
    void settle();
    bool isPackage() const;

    FNPath base;
    bool skipHidden;
    bool started = false;
    std::string folderBytes;
    std::vector<std::string> entries;
    std::size_t index = 0;
    IPtr<FNPath> entry;
};
