#include "foundation/text/cmstring.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/resource/archivename.h"
#include "storage/resource/farchiveprogress.h"
#include "storage/resource/ffilearchive.h"
#include "storage/stream/fstream.h"
#include "storage/virtual/archivecopy.h"
#include "storage/virtual/innerpath.h"

// Out of the archive: extraction, copying, and the folder for what others open.

namespace
{
/// The hash that tells archives of one name apart stays below this.
constexpr unsigned kHashSize = 65535;

/// Whether a file may be made there: what is there is none, or a plain file, and no way to another place.
bool isPlainPlace(FNPath& place)
{
    if (gFileSystem->isSymlink(&place) || gFileSystem->dirExists(&place))
        return false;
    return !gFileSystem->fileExists(&place) || gFileSystem->getFileSize(&place) >= 0;
}
} // namespace

// Extraction

bool FFileArchive::extractAll(const FNPath& target, UProgressHook* hook)
{
    return extractFolder(root, target, hook);
}

bool FFileArchive::extractFolder(const FFileArchiveNode* node, const FNPath& target, UProgressHook* hook)
{
    if (!node || !node->isFolder() || !gFileSystem)
        return false;
    uint64 bytes = 0;
    node->countFiles(true, false, &bytes);
    FArchiveProgress progress(hook, static_cast<int64>(bytes));
    leftOut.clear();
    FNPath made(target);
    made.setPathType(FPath::kFolder);
    return gFileSystem->createDir(&made) && extractInto(*node, made, progress);
}

bool FFileArchive::leaveOut(const FFileArchiveNode& node)
{
    if (leftOut.isFull())
    {
        leftOut.omit();
        return false;
    }
    FPath inner;
    node.getPath(inner);
    leftOut.add(InnerPath::textOf(inner));
    return false;
}

bool FFileArchive::extractInto(const FFileArchiveNode& folder, const FNPath& target,
                               FArchiveProgress& progress)
{
    bool isWhole = true;
    for (const IPtr<FFileArchiveNode>& child : folder.getChildren())
    {
        if (progress.wasCanceled())
            return false;
        isWhole = extractChild(*child, target, progress) && isWhole;
    }
    return isWhole;
}

bool FFileArchive::extractChild(const FFileArchiveNode& child, const FNPath& folder,
                                FArchiveProgress& progress)
{
    if (!ArchiveName::isSafe(child.getName()))
        return leaveOut(child);
    const int type = child.isFolder() ? FPath::kFolder : FPath::kFile;
    FNPath place(child.getName().text16(), &folder, type);
    if (!child.isFolder())
        return extractContent(child, place, progress.nextFile(child.getName())) || leaveOut(child);
    if (gFileSystem->isSymlink(&place) || !gFileSystem->createDir(&place))
        return leaveOut(child);
    return extractInto(child, place, progress);
}

bool FFileArchive::extractFile(const FFileArchiveNode* node, const FNPath& target, UProgressHook* hook)
{
    if (!node || node->isFolder() || !gFileSystem)
        return false;
    FArchiveProgress progress(hook, node->getFileSize());
    FNPath place(target);
    return extractContent(*node, place, progress.nextFile(node->getName()));
}

bool FFileArchive::extractContent(const FFileArchiveNode& node, FNPath& target, UProgressHook* hook)
{
    if (!isPlainPlace(target))
        return false;
    // What is there already stays until the new file is whole, and isn't written to, for it may have other names.
    FNPath fresh(target);
    const bool replaces = gFileSystem->fileExists(&target);
    if (replaces)
    {
        fresh.setName(u"extracted");
        if (!fresh.uniqueName())
            return false;
    }
    const IPtr<FStream> content = adopt(openNode(&node));
    FStream* file = content ? gFileSystem->createFile(&fresh, kFileWrite, nullptr) : nullptr;
    if (!file)
        return false;
    // Too many bytes are as wrong as too few: the table is then about something else.
    bool isWhole = copyContent(*content, *file, hook);
    isWhole = isWhole && (node.getReference() || file->tell() == node.getFileSize());
    isWhole = gFileSystem->closeFile(file) && isWhole;
    if (isWhole && replaces)
        isWhole = gFileSystem->moveFile(&fresh, &target, false);
    if (!isWhole)
        gFileSystem->removeFile(&fresh);
    return isWhole;
}

bool FFileArchive::copyFile(FPath* from, FPath* to, UProgressHook* hook, int* error)
{
    if (isInArchive(from) || isInArchive(to))
        return copyAcrossArchives(from, to, hook, error);
    const FFileArchiveNode* node = lookupNode(from);
    const IPtr<FNPath> native = FNFileSystem::getNativePathFromPath(to);
    if (!node || !native)
        return false;
    if (!native->isFolder())
        return extractFile(node, *native, hook);
    if (!gFileSystem || !gFileSystem->dirExists(native) || !ArchiveName::isSafe(node->getName()))
        return false;
    return extractFile(node, FNPath(node->getName().text16(), native.get(), FPath::kFile), hook);
}

// Cache folder

FString FFileArchive::archiveName() const
{
    if (!path)
        return u"archive";
    const FString text = InnerPath::textOf(*path);
    FString name(path->getName());
    if (!ArchiveName::isSafe(name))
        name.assign(u"archive");
    if (!(flags & kPrivateCache))
        return name;
    FString prefix;
    prefix.printf(u"(%04X)", CmString(text).hash(kHashSize));
    return prefix.append(name);
}

const FNPath* FFileArchive::getCacheFolder()
{
    if (cacheFolder)
        return cacheFolder;
    const FNPath all(u"File Archive", FNPath::kTempFolder, FPath::kFolder, u"~Cache", true);
    if (all.getName().isEmpty())
        return nullptr;
    cacheFolder = adopt(new FNPath(archiveName().text16(), &all, FPath::kFolder));
    if (!(flags & kPrivateCache) && gFileSystem)
        gFileSystem->createDir(cacheFolder);
    return cacheFolder;
}

void FFileArchive::setCacheFolder(const FNPath* folder)
{
    cacheFolder = folder ? adopt(new FNPath(*folder)) : nullptr;
}

bool FFileArchive::makeCachedPath(FNPath& result, const FFileArchiveNode* node)
{
    if (!node || !getCacheFolder())
        return false;
    if (!node->getParent())
    {
        result = *cacheFolder;
        return true;
    }
    FNPath folder(FPath::kFolder);
    if (!ArchiveName::isSafe(node->getName()) || !makeCachedPath(folder, node->getParent()))
        return false;
    result = FNPath(node->getName().text16(), &folder, node->isFolder() ? FPath::kFolder : FPath::kFile);
    return true;
}
