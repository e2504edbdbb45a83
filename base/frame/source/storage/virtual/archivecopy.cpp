#include "storage/virtual/archivecopy.h"

#include "storage/filesystem/fnfilesystem.h"
#include "storage/filesystem/iarchivelookup.h"
#include "storage/path/fnpath.h"
#include "storage/stream/fstream.h"
#include "storage/virtual/fvfilesystem.h"
#include "storage/virtual/innerpath.h"

namespace
{
/// A path with the file system that serves it in the end, behind all mounts; none where that isn't allowed.
struct Place
{
    Place(FPath* outer, bool isToWrite) : files(gFileSystem), path(outer)
    {
        IArchiveLookup* archives = IArchiveLookup::instance();
        const IPtr<FFileSystem> archive = archives ? adopt(archives->getFileSystem(outer)) : nullptr;
        if (!archive)
            return;
        files = archive;
        path = adopt(archives->getPath(*outer));
        while (const FVFileSystem* mounted = FCast(FVFileSystem, static_cast<FObject*>(files.get())))
        {
            path = isToWrite && !mounted->isWritable() ? nullptr : mounted->translatePath(path);
            files = path ? IPtr<FFileSystem>(mounted->getTarget()) : nullptr;
        }
    }

    /// Whether it is on disk, and no URL.
    bool isNative() const
    {
        return FCast(FNFileSystem, static_cast<FObject*>(files.get())) &&
               FNFileSystem::getNativePathFromPath(path);
    }

    IPtr<FFileSystem> files;
    IPtr<FPath> path;
};

/// Whether both are one file, which making the target would empty.
bool areSame(const Place& source, const Place& target)
{
    std::vector<FString> inSource;
    std::vector<FString> inTarget;
    return source.files == target.files && InnerPath::split(*source.path, inSource) &&
           InnerPath::split(*target.path, inTarget) && inSource == inTarget;
}

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
    const Place source(from, false);
    IPtr<FPath> goal = to;
    if (to->isFolder() && source.path)
        goal = InnerPath::childOf(*to, source.path->getName(), FPath::kFile);
    const Place target(goal, true);
    if (!source.files || !target.files)
        return false;
    if (source.isNative() && target.isNative())
        return target.files->copyFile(source.path, target.path, hook, error);
    if (areSame(source, target))
        return false;
    FStream* stream = source.files->openFile(source.path, kFileRead | kFileShare, error);
    if (!stream)
        return false;
    const bool isCopied = copyStream(target, *stream, hook, error);
    return source.files->closeFile(stream) && isCopied;
}
