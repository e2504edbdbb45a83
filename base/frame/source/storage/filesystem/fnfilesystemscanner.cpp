#include "storage/filesystem/fnfilesystemscanner.h"

#include "storage/filesystem/fnfilesystem.h"

FNFileSystemScanner::FNFileSystemScanner()
{
    basePaths.takeElements();
    waiting.retainElements();
}

FNFileSystemScanner::FNFileSystemScanner(const FNPath* folder) : FNFileSystemScanner()
{
    addBasePath(folder);
}

FNFileSystemScanner::FNFileSystemScanner(const CmLinkedList* folders) : FNFileSystemScanner()
{
    for (int i = 0; folders && i < folders->total(); i++)
        addBasePath(FCast(FNPath, folders->at(i)));
}

FNFileSystemScanner::FNFileSystemScanner(int driveMask) : FNFileSystemScanner()
{
    addDefaultBasePaths(driveMask);
}

void FNFileSystemScanner::addBasePath(const FNPath* folder)
{
    if (folder)
        basePaths.add(new FNPath(*folder));
}

void FNFileSystemScanner::addDefaultBasePaths(int driveMask)
{
    if (gFileSystem)
        gFileSystem->getDrives(basePaths, driveMask);
}

void FNFileSystemScanner::first()
{
    started = true;
    walk.reset();
    waiting.removeAll();
    waiting.addAllFrom(&basePaths);
    settle();
}

void FNFileSystemScanner::next()
{
    if (done())
        return;
    walk->next();
    settle();
}

// Goes on to the next folder that has an entry, and notes a folder that is found.
void FNFileSystemScanner::settle()
{
    while (!walk || walk->done())
    {
        const IPtr<FNPath> folder = FCast(FNPath, waiting.at(0));
        walk.reset();
        if (!folder)
            return;
        waiting.removeAt(0);
        walk = std::make_unique<FNFileIterator>(folder.get());
        walk->first();
    }
    const IPtr<FPath> entry = walk->current();
    if (entry->isFolder())
        waiting.add(entry);
}

bool FNFileSystemScanner::done()
{
    if (!started)
        first();
    return !walk;
}

IPtr<FPath> FNFileSystemScanner::current()
{
    return done() ? nullptr : walk->current();
}
