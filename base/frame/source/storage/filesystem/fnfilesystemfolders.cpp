#include "storage/filesystem/fnfilesystem.h"

#include "storage/filesystem/desktopservices.h"
#include "storage/filesystem/diskname.h"
#include "storage/filesystem/ffileiterator.h"
#include "storage/filesystem/filesystemchange.h"
#include "storage/filesystem/fnfileiterator.h"
#include "storage/filesystem/fnfilesystemscanner.h"
#include "storage/filesystem/iarchivelookup.h"
#include "storage/filesystem/platformfiles.h"
#include "storage/path/filenametext.h"

#include <cerrno>

// Folders, links, the trash and volumes.

namespace
{
using PlatformFiles::Kind;
using PlatformFiles::Medium;

IPtr<FNPath> nativeOf(const IPtr<FPath>& entry)
{
    return FCast(FNPath, entry.get());
}

int driveTypeOf(Medium medium)
{
    switch (medium)
    {
    case Medium::kNetwork:
        return FNFileSystem::kNetworkDrive;
    case Medium::kOptical:
        return FNFileSystem::kOpticalDrive;
    case Medium::kRemovable:
        return FNFileSystem::kRemovableDrive;
    default:
        return FNFileSystem::kFixedDrive;
    }
}
} // namespace

// Making and removing

bool FNFileSystem::createDir(FPath* path)
{
    const IPtr<FNPath> native = getNativePathFromPath(path);
    return native && makeFolders(*native) == 0;
}

// Gives the system's error number. An empty path is the folder in which the process is.
int FNFileSystem::makeFolders(const FNPath& path)
{
    const std::string whole = DiskName::find(path);
    if (whole.empty() || PlatformFiles::look(whole).kind == Kind::kFolder)
        return 0;
    for (size_t end = whole.find('/', 1);; end = whole.find('/', end + 1))
    {
        const std::string level = whole.substr(0, end);
        if (const int error = makeLevel(level))
            return error;
        if (end == std::string::npos)
            return 0;
    }
}

int FNFileSystem::makeLevel(const std::string& level)
{
    const Kind kind = PlatformFiles::look(level).kind;
    if (kind != Kind::kMissing)
        return kind == Kind::kFolder ? 0 : ENOTDIR;
    FNPath made(FPath::kFolder);
    made.fromPlatformPath(level.c_str());
    const int error = PlatformFiles::makeFolder(level, isPrivate(made));
    // Another process may have been quicker.
    if (error != 0)
        return PlatformFiles::look(level).kind == Kind::kFolder ? 0 : error;
    onFileSystemChange(FileSystemChange::kWritten, &made, nullptr);
    return 0;
}

bool FNFileSystem::removeDir(FPath* path, bool recursive)
{
    const IPtr<FNPath> native = getNativePathFromPath(path);
    if (!native)
        return false;
    const std::string folder = DiskName::find(*native);
    const PlatformFiles::Facts facts = PlatformFiles::look(folder);
    // What a link leads to isn't ours to empty.
    if (facts.kind != Kind::kFolder || facts.isLink)
        return false;
    if (recursive && !removeContent(*native))
        return false;
    onFileSystemChange(FileSystemChange::kRemoved, native, nullptr);
    return PlatformFiles::removeFolder(folder) == 0;
}

bool FNFileSystem::removeContent(const FNPath& folder)
{
    bool isEmptied = true;
    FNFileIterator walk(&folder);
    for (walk.first(); !walk.done(); walk.next())
    {
        const IPtr<FPath> entry = walk.current();
        isEmptied = (entry->isFolder() ? removeDir(entry, true) : removeFile(entry)) && isEmptied;
    }
    return isEmptied;
}

bool FNFileSystem::isFolderEmpty(FNPath* path)
{
    if (!dirExists(path))
        return false;
    FNFileSystemScanner walk(path);
    for (walk.first(); !walk.done(); walk.next())
        if (!walk.current()->isFolder())
            return false;
    return true;
}

bool FNFileSystem::removeEmptyFolders(FNPath* path)
{
    if (!dirExists(path))
        return false;
    bool areRemoved = true;
    FNFileIterator walk(path);
    for (walk.first(); !walk.done(); walk.next())
    {
        const IPtr<FNPath> entry = nativeOf(walk.current());
        if (!entry->isFolder())
            continue;
        const bool removed = isFolderEmpty(entry) ? removeDir(entry, true) : removeEmptyFolders(entry);
        areRemoved = removed && areRemoved;
    }
    return areRemoved;
}

// Walking and copying

FFileIterator* FNFileSystem::newIterator(const FPath* path, bool recursive)
{
    const IPtr<FNPath> native = getNativePathFromPath(const_cast<FPath*>(path));
    if (!native)
        return nullptr;
    IFileIteratorImpl* walk = nullptr;
    if (recursive)
        walk = new FNFileSystemScanner(native.get());
    else
        walk = new FNFileIterator(native.get());
    return new FFileIterator(walk);
}

bool FNFileSystem::copyFolderStructure(FNPath* from, FNPath* to)
{
    return dirExists(from) && to && copyTree(*from, *to, false, nullptr);
}

bool FNFileSystem::copyFolderAndFileStructure(FNPath* from, FNPath* to, UProgressHook* hook)
{
    return dirExists(from) && to && copyTree(*from, *to, true, hook);
}

bool FNFileSystem::copyTree(const FNPath& from, const FNPath& to, bool withFiles, UProgressHook* hook)
{
    FNPath target(to);
    // A copy into the folder itself would find its own copies, for ever.
    if (target == from || target.isInDir(&from) || !createDir(&target))
        return false;
    FNFileIterator walk(&from);
    for (walk.first(); !walk.done(); walk.next())
    {
        const IPtr<FNPath> entry = nativeOf(walk.current());
        FNPath place(entry->getName().text16(), &target, entry->getPathType());
        bool isCopied = true;
        if (entry->isFolder())
            isCopied = copyTree(*entry, place, withFiles, hook);
        else if (withFiles)
            isCopied = copyFile(entry, &place, hook, nullptr);
        if (!isCopied)
            return false;
    }
    return true;
}

bool FNFileSystem::findFile(const FNPath* folder, const char16* name, bool recursive, FNPath& result)
{
    const IPtr<FFileIterator> walk = adopt(newIterator(folder, recursive));
    if (!walk || !name)
        return false;
    FString wanted(name);
    wanted.normalize(kUnicodeNormC);
    for (walk->first(); !walk->done(); walk->next())
    {
        const IPtr<FNPath> entry = nativeOf(walk->current());
        if (entry->isFolder() || !(entry->getName() == wanted))
            continue;
        result = *entry;
        return true;
    }
    return false;
}

bool FNFileSystem::syncFolder(FPath* path)
{
    const IPtr<FNPath> native = getNativePathFromPath(path);
    return native && PlatformFiles::syncFolder(DiskName::find(*native)) == 0;
}

bool FNFileSystem::changeDir(FPath* path)
{
    const IPtr<FNPath> native = getNativePathFromPath(path);
    return native && PlatformFiles::changeFolder(DiskName::find(*native)) == 0;
}

bool FNFileSystem::getDirName(FPath* path, FString& result)
{
    const IPtr<FNPath> native = getNativePathFromPath(path);
    if (!native)
        return false;
    if (native->isFolder())
        return native->getFullPath(result);
    result = native->getPathName();
    return !result.isEmpty();
}

bool FNFileSystem::trashFile(FPath* path)
{
    const IPtr<FNPath> native = getNativePathFromPath(path);
    if (!native || !DesktopServices::trash(DiskName::find(*native).c_str()))
        return false;
    onFileSystemChange(FileSystemChange::kRemoved, native, nullptr);
    return true;
}

// Links

bool FNFileSystem::isSymlink(FPath* path)
{
    const IPtr<FNPath> native = getNativePathFromPath(path);
    return native && PlatformFiles::look(DiskName::find(*native)).isLink;
}

bool FNFileSystem::readSymlink(FPath* path, FNPath& target)
{
    const IPtr<FNPath> native = getNativePathFromPath(path);
    std::string text;
    return native && PlatformFiles::readSymlink(DiskName::find(*native), text) &&
           target.fromPlatformPath(text.c_str());
}

bool FNFileSystem::createSymlink(FPath* link, FPath* target)
{
    const IPtr<FNPath> place = getNativePathFromPath(link);
    const IPtr<FNPath> goal = getNativePathFromPath(target);
    if (!place || !goal)
        return false;
    // A relative goal counts from the link, so only an absolute one can be looked up.
    const std::string text = goal->isAbsolute() ? DiskName::find(*goal) : goal->platformPath();
    if (PlatformFiles::makeSymlink(DiskName::find(*place), text) != 0)
        return false;
    onFileSystemChange(FileSystemChange::kWritten, place, nullptr);
    return true;
}

bool FNFileSystem::createLink(FPath* link, FPath* target)
{
    const IPtr<FNPath> place = getNativePathFromPath(link);
    const IPtr<FNPath> goal = getNativePathFromPath(target);
    if (!place || !goal || PlatformFiles::makeLink(DiskName::find(*place), DiskName::find(*goal)) != 0)
        return false;
    onFileSystemChange(FileSystemChange::kWritten, place, nullptr);
    return true;
}

bool FNFileSystem::checkResolveLink(FNPath* path)
{
    if (!path)
        return false;
    const std::string spelling = DiskName::find(*path);
    const PlatformFiles::Facts facts = PlatformFiles::look(spelling);
    if (!facts.isLink)
        return true;
    std::string goal;
    if (!PlatformFiles::resolve(spelling, goal))
        return false;
    path->setPathType(facts.kind == Kind::kFolder ? FPath::kFolder : FPath::kFile);
    return path->fromPlatformPath(goal.c_str());
}

// Volumes

int FNFileSystem::getDrives(CmContainer& result, int mask)
{
    int count = 0;
    for (const PlatformFiles::Volume& volume : PlatformFiles::listVolumes())
    {
        if ((driveTypeOf(volume.medium) & mask) == 0)
            continue;
        IPtr<FNPath> drive = adopt(new FNPath(FPath::kFolder));
        drive->fromPlatformPath(volume.mountPoint.c_str());
        if (!result.add(drive))
            continue;
        count++;
        // A container that counts for itself has its reference by now.
        if (result.getOwnership() != CmContainer::kRetained)
            (void)drive.take();
    }
    return count;
}

int FNFileSystem::getDriveType(FNPath* path)
{
    IArchiveLookup* archives = IArchiveLookup::instance();
    if (archives && path && archives->isArchivePath(path))
        return kArchiveDrive;
    return path ? driveTypeOf(PlatformFiles::mediumOf(DiskName::find(*path))) : kFixedDrive;
}

IPtr<FNPath> FNFileSystem::getRootDir(const FNPath* path)
{
    if (!path || !path->isAbsolute())
        return nullptr;
    IPtr<FNPath> root = adopt(new FNPath(*path));
    while (root->ascend())
    {
    }
    return root;
}

bool FNFileSystem::getFreeBytesOnDisk(FPath* path, uint64& freeBytes, uint64* total)
{
    const IPtr<FNPath> native = getNativePathFromPath(path);
    uint64 all = 0;
    if (!native || !PlatformFiles::freeBytes(DiskName::find(*native), freeBytes, all))
        return false;
    if (total)
        *total = all;
    return true;
}

bool FNFileSystem::getVolumeID(FPath*, uint32&)
{
    return false;
}

bool FNFileSystem::getVolumeSerialNumber(FPath*, uint32&)
{
    return false;
}

bool FNFileSystem::getPhysicalDiskUniqueIDString(FPath*, FString&)
{
    return false;
}
