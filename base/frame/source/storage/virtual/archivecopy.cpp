#include "storage/virtual/archivecopy.h"

#include "storage/filesystem/fnfilesystem.h"
#include "storage/filesystem/iarchivelookup.h"
#include "storage/path/fpath.h"
#include "storage/stream/fstream.h"
#include "storage/virtual/innerpath.h"

namespace
{
/// A path with the file system that serves it.
struct Place
{
    explicit Place(FPath* outer) : files(gFileSystem), path(outer)
    {
        IArchiveLookup* archives = IArchiveLookup::instance();
        const IPtr<FFileSystem> archive = archives ? adopt(archives->getFileSystem(outer)) : nullptr;
        if (!archive)
            return;
        files = archive;
        path = adopt(archives->getPath(*outer));
    }

    IPtr<FFileSystem> files;
    IPtr<FPath> path;
};

bool copyStream(const Place& target, FStream& source, UProgressHook* hook, int* error)
{
    FStream* stream = target.files->createFile(target.path, kFileWrite, error);
    if (!stream)
        return false;
    bool isWhole = FFileSystem::copyContent(source, *stream, hook);
    isWhole = target.files->closeFile(stream) && isWhole;
    if (!isWhole)
        target.files->removeFile(target.path);
    return isWhole;
}
} // namespace

bool isInArchive(const FPath* path)
{
    IArchiveLookup* archives = IArchiveLookup::instance();
    return archives && path && archives->isArchivePath(path);
}

bool copyAcrossArchives(FPath* from, FPath* to, UProgressHook* hook, int* error)
{
    if (!from || !to)
        return false;
    const Place source(from);
    IPtr<FPath> goal = to;
    if (to->isFolder())
        goal = InnerPath::childOf(*to, source.path->getName(), FPath::kFile);
    const Place target(goal);
    if (!source.files || !target.files)
        return false;
    FStream* stream = source.files->openFile(source.path, kFileRead | kFileShare, error);
    if (!stream)
        return false;
    const bool isCopied = copyStream(target, *stream, hook, error);
    return source.files->closeFile(stream) && isCopied;
}
