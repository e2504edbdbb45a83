#pragma once

#include "containers/sequence/cmlinkedlist.h"
#include "storage/filesystem/fnfileiterator.h"

#include <memory>

/// Walks folders on disk and all that is below them: a folder's entries first, then those of its folders.
/// Links are told but not followed, so a walk ends. One thread at a time.
class FNFileSystemScanner : public IFileIteratorImpl
{
public:
    FNFileSystemScanner();
    explicit FNFileSystemScanner(const FNPath* folder);
    /// Begins with each FNPath of the list, which is copied.
    explicit FNFileSystemScanner(const CmLinkedList* folders);
    /// Begins with the drives of the kinds in the mask.
    explicit FNFileSystemScanner(int driveMask);

    void addBasePath(const FNPath* folder);
    void addDefaultBasePaths(int driveMask);

    void first() override;
    void next() override;
    bool done() override;
    IPtr<FPath> current() override;

private:
    void settle();

    CmLinkedList basePaths;
    CmLinkedList waiting;
    std::unique_ptr<FNFileIterator> walk;
    bool started = false;
};
