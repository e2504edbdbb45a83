#include "storage/filesystem/fnfilesystem.h"

#include "containers/value/cmtime.h"
#include "foundation/message/fmessage.h"
#include "foundation/message/fmessenger.h"
#include "storage/filesystem/diskname.h"
#include "storage/filesystem/ffileiterator.h"
#include "storage/filesystem/filesystemchange.h"
#include "storage/filesystem/fnfileiterator.h"
#include "storage/filesystem/fnfilesystemscanner.h"
#include "storage/filesystem/fnmonitor.h"
#include "storage/filesystem/iarchivelookup.h"
#include "storage/filesystem/platformfiles.h"
#include "storage/filesystem/volumewatch.h"
#include "storage/path/filenametext.h"
#include "storage/path/istandardfolders.h"
#include "storage/stream/ffilestream.h"

#include <cerrno>
#include <cstring>

FNFileSystem* gFileSystem = nullptr;

namespace
{
using PlatformFiles::Kind;

// The days from 1 January 1901, with which CmTime begins, to 1 January 1970.
constexpr int64 kDaysToEpoch = 25202;

constexpr const char* kMountEvents[] = {"VolMount", "VolUnmount"};
constexpr const char* kRootPath = "kRootPath";

CmTime timeOf(int64 secondsSince1970)
{
    return CmTime(static_cast<unsigned>(secondsSince1970 + kDaysToEpoch * 86400));
}

bool changesFile(int flags)
{
    return (flags & (kFileWrite | kFileReadWrite)) != 0;
}

void store(int* error, int reason)
{
    if (error)
        *error = reason;
}

IPtr<FFileSystem> archiveOf(const FPath* path)
{
    IArchiveLookup* lookup = IArchiveLookup::instance();
    return lookup && path ? adopt(lookup->getFileSystem(path)) : nullptr;
}

IPtr<FPath> insideArchive(const FPath& path)
{
    return adopt(IArchiveLookup::instance()->getPath(path));
}

// The literal of a mount event, which a message may keep; null where it is none.
const char* mountEventOf(const char* eventName)
{
    for (const char* known : kMountEvents)
        if (eventName && strcmp(eventName, known) == 0)
            return known;
    return nullptr;
}

// A path takes the location of another of any kind.
void takeLocation(FPath& path, const FNPath& location)
{
    FString text;
    location.getFullPath(text);
    path.fromString(text.text16(), location.getPathType());
}
} // namespace

FNFileSystem::FNFileSystem() = default;

FNFileSystem::~FNFileSystem()
{
    setLastPath(nullptr);
}

bool FNFileSystem::isPrivate(const FNPath& path)
{
    IStandardFolders* folders = IStandardFolders::instance();
    const FNPath userFolder(folders ? folders->getUserPath() : nullptr, FPath::kFolder);
    return userFolder.isAbsolute() && (path == userFolder || path.isInDir(&userFolder));
}

// Opening and closing

FStream* FNFileSystem::attachFile(const FNPath& path, int descriptor, int flags, const char* fileMode,
                                  int* error)
{
    const IPtr<FFileStream> stream = adopt(new FFileStream(flags));
    // A copy, since the caller may go on to other places with its own.
    const IPtr<FNPath> own = adopt(new FNPath(path));
    stream->setPath(own);
    if (!own->getKnownFileType().isValid())
        own->detectFileType(false);
    stream->setFileType(own->getKnownFileType());
    const int32 alignment = fileMode ? 0 : PlatformFiles::blockSizeOf(descriptor);
    if (!stream->attach(descriptor, fileMode, alignment))
    {
        store(error, stream->getFirstError(true));
        return nullptr;
    }
    stream->addRef();
    return stream.get();
}

FStream* FNFileSystem::createFile(FPath* path, int flags, int* error)
{
    const IPtr<FNPath> native = getNativePathFromPath(path);
    if (!native)
        return nullptr;
    const FNPath folder(native->getPathName().text16(), FPath::kFolder);
    if (const int reason = makeFolders(folder))
    {
        store(error, reason);
        return nullptr;
    }
    PlatformFiles::Opening how;
    how.unbuffered = (flags & kFileDirect) != 0;
    how.read = how.unbuffered || changesFile(flags);
    how.write = !how.unbuffered || changesFile(flags);
    how.create = true;
    how.truncate = !how.unbuffered;
    how.ownerOnly = isPrivate(*native);
    int reason = 0;
    const int descriptor = PlatformFiles::open(DiskName::find(*native), how, reason);
    if (descriptor < 0)
    {
        store(error, reason);
        return nullptr;
    }
    const char* fileMode = how.unbuffered ? nullptr : how.read ? "wb+" : "wb";
    FStream* stream = attachFile(*native, descriptor, flags, fileMode, error);
    if (FFileStream* file = FCast(FFileStream, stream))
        file->setSyncOnClose(how.ownerOnly && how.write);
    // Here the signature and the type's code would go on the file, on a disk that keeps such.
    return stream;
}

FStream* FNFileSystem::openFile(FPath* path, int flags, int* error)
{
    if (!path)
        return nullptr;
    const IPtr<FFileSystem> archive = (flags & kFileDirect) ? nullptr : archiveOf(path);
    if (archive)
        return archive->openFile(insideArchive(*path), kFileRead | kFileShare, error);
    const IPtr<FNPath> native = getNativePathFromPath(path);
    if (native)
        return openNative(*native, flags, error);
    return (flags & kFileRead) ? openUrl(path) : nullptr;
}

FStream* FNFileSystem::openNative(FNPath& path, int flags, int* error)
{
    if (path.isFolder())
    {
        store(error, EISDIR);
        return nullptr;
    }
    PlatformFiles::Opening how;
    how.read = true;
    how.write = changesFile(flags);
    how.unbuffered = (flags & kFileDirect) != 0;
    int reason = 0;
    const int descriptor = PlatformFiles::open(DiskName::find(path), how, reason);
    if (descriptor < 0)
    {
        store(error, reason);
        return nullptr;
    }
    const char* fileMode = how.unbuffered ? nullptr : how.write ? "rb+" : "rb";
    FStream* stream = attachFile(path, descriptor, flags, fileMode, error);
    if (FFileStream* file = FCast(FFileStream, stream))
        file->setSyncOnClose(how.write && isPrivate(path));
    return stream;
}

bool FNFileSystem::closeFile(FStream* stream)
{
    if (!stream)
        return false;
    bool isWhole = true;
    if (FFileStream* file = FCast(FFileStream, stream))
    {
        const bool wasOpen = file->isValid();
        isWhole = file->close();
        if (wasOpen && file->isWritable())
            onFileSystemChange(FileSystemChange::kWritten, file->getPath(), nullptr);
    }
    else
        isWhole = closeUrlStream(stream) && stream->verify();
    stream->release();
    return isWhole;
}

// Questions

bool FNFileSystem::fileExists(FPath* path)
{
    if (const IPtr<FFileSystem> archive = archiveOf(path))
        return archive->fileExists(insideArchive(*path));
    const IPtr<FNPath> native = getNativePathFromPath(path);
    if (!native)
        return false;
    const Kind kind = PlatformFiles::look(DiskName::find(*native)).kind;
    return kind == Kind::kFile || kind == Kind::kOther;
}

bool FNFileSystem::dirExists(FNPath* path)
{
    return path && PlatformFiles::look(DiskName::find(*path)).kind == Kind::kFolder;
}

bool FNFileSystem::getFileTimes(FPath* path, CmTime& created, CmTime& modified)
{
    const IPtr<FNPath> native = getNativePathFromPath(path);
    if (!native)
        return false;
    const PlatformFiles::Facts facts = PlatformFiles::look(DiskName::find(*native));
    if (facts.kind == Kind::kMissing)
        return false;
    created = timeOf(facts.created);
    modified = timeOf(facts.modified);
    return true;
}

int64 FNFileSystem::getFileSize(FPath* path)
{
    if (const IPtr<FFileSystem> archive = archiveOf(path))
        return archive->getFileSize(insideArchive(*path));
    const IPtr<FNPath> native = getNativePathFromPath(path);
    if (!native)
        return -1;
    const PlatformFiles::Facts facts = PlatformFiles::look(DiskName::find(*native));
    return facts.kind == Kind::kFile ? facts.size : -1;
}

int64 FNFileSystem::getFileSize(FStream* stream)
{
    int64 size = -1;
    if (FFileStream* file = FCast(FFileStream, stream))
        return file->getStreamSize(size) == kResultOk ? size : -1;
    return FFileSystem::getFileSize(stream);
}

bool FNFileSystem::canWrite(FPath* path)
{
    const IPtr<FNPath> native = getNativePathFromPath(path);
    return native && PlatformFiles::isWritable(DiskName::find(*native));
}

bool FNFileSystem::enableWrite(FPath* path, bool state)
{
    const IPtr<FNPath> native = getNativePathFromPath(path);
    return native && PlatformFiles::setWritable(DiskName::find(*native), state) == 0;
}

bool FNFileSystem::copyRights(FPath* from, FPath* to)
{
    const IPtr<FNPath> source = getNativePathFromPath(from);
    const IPtr<FNPath> target = getNativePathFromPath(to);
    return source && target &&
           PlatformFiles::copyRights(DiskName::find(*source), DiskName::find(*target)) == 0;
}

bool FNFileSystem::isHidden(FPath* path)
{
    return path && (path->getName().testChar16(0, u'.') || !path->isVisible());
}

bool FNFileSystem::changeFileType(FPath*, const FFileType&)
{
    return false;
}

bool FNFileSystem::verifyType(FPath* path, const FFileType& fileType)
{
    const IPtr<FNPath> native = getNativePathFromPath(path);
    if (!native || !fileExists(native))
        return false;
    FNPath own(*native);
    own.detectFileType(true);
    return own.getKnownFileType() == fileType;
}

// Changes

bool FNFileSystem::removeFile(FPath* path)
{
    const IPtr<FNPath> native = getNativePathFromPath(path);
    if (!native)
        return false;
    onFileSystemChange(FileSystemChange::kRemoved, native, nullptr);
    return PlatformFiles::removeFile(DiskName::find(*native)) == 0;
}

bool FNFileSystem::renameFile(FPath* path, const char16* newName)
{
    const IPtr<FNPath> native = getNativePathFromPath(path);
    if (!native || !newName)
        return false;
    const FNPath former(*native);
    const FString formerName(path->getName());
    path->setName(newName);
    const IPtr<FNPath> target = getNativePathFromPath(path);
    if (!target || PlatformFiles::rename(DiskName::find(former), DiskName::find(*target)) != 0)
    {
        path->setName(formerName.text16());
        return false;
    }
    onFileSystemChange(FileSystemChange::kWritten, &former, target);
    return true;
}

bool FNFileSystem::moveFile(FPath* from, FPath* to, bool updateSource)
{
    const IPtr<FNPath> source = getNativePathFromPath(from);
    const IPtr<FNPath> target = getNativePathFromPath(to);
    if (!source || !target)
        return false;
    const int error = PlatformFiles::rename(DiskName::find(*source), DiskName::find(*target));
    if (error != 0 && !(PlatformFiles::isAcrossDevices(error) && moveAcrossDevices(*source, *target)))
        return false;
    onFileSystemChange(FileSystemChange::kRemoved, source, nullptr);
    onFileSystemChange(FileSystemChange::kWritten, target, nullptr);
    if (updateSource)
        takeLocation(*from, *target);
    return true;
}

bool FNFileSystem::moveAcrossDevices(FNPath& from, FNPath& to)
{
    return copyFile(&from, &to, nullptr, nullptr) && removeFile(&from);
}

bool FNFileSystem::copyFile(FPath* from, FPath* to, UProgressHook* hook, int* error)
{
    for (const FPath* path : {from, to})
        if (const IPtr<FFileSystem> archive = archiveOf(path))
            return archive->copyFile(from, to, hook, error);
    const IPtr<FNPath> source = getNativePathFromPath(from);
    IPtr<FNPath> target = getNativePathFromPath(to);
    if (!source || !target || source->isFolder() || !fileExists(source))
        return false;
    if (target->isFolder())
    {
        if (!dirExists(target))
            return false;
        target = adopt(new FNPath(source->getName().text16(), target.get(), FPath::kFile));
    }
    return !dirExists(target) && copyNative(*source, *target, hook, error);
}

bool FNFileSystem::copyNative(FNPath& from, FNPath& to, UProgressHook* hook, int* error)
{
    const std::string source = DiskName::find(from);
    // Creating the target would empty the source.
    if (PlatformFiles::isSame(source, DiskName::find(to)))
        return false;
    if (!FFileSystem::copyFile(&from, &to, hook, error))
        return false;
    // The content has arrived; rights and times are worth no failure, and what is private stays so.
    if (!isPrivate(to))
        (void)PlatformFiles::copyAttributes(source, DiskName::find(to));
    return true;
}

void FNFileSystem::onFileSystemChange(int kind, const FNPath* path, const FNPath* newPath)
{
    const IPtr<FNMonitor> monitor = FNMonitor::existing();
    if (!path || !gMessenger || !monitor || !monitor->isRunning() || monitor->isPathExcluded(*path))
        return;
    FNPath folder(*path);
    folder.ascend();
    if (!newPath)
    {
        monitor->post(kind, folder, nullptr);
        return;
    }
    FNPath newFolder(*newPath);
    newFolder.ascend();
    monitor->post(kind, folder, &newFolder);
}

// Mount events

void FNFileSystem::subscribeToMountEvent(CmObject* listener)
{
    if (listener && !mountListeners.containsAbs(listener))
        mountListeners.add(listener);
    if (!volumeWatch && !mountListeners.isEmpty())
        volumeWatch = std::make_unique<VolumeWatch>(*this);
}

void FNFileSystem::unsubscribeFromMountEvent(CmObject* listener)
{
    mountListeners.remove(listener);
    if (mountListeners.isEmpty())
        volumeWatch.reset();
}

void FNFileSystem::onMountEvent(const char* eventName, FNPath* root)
{
    const char* type = mountEventOf(eventName);
    if (!gMessenger || !type || !root)
        return;
    for (int i = 0; i < mountListeners.total(); i++)
    {
        auto* message = new FMessage(type);
        message->add(kRootPath, adopt(new FNPath(*root)), true);
        gMessenger->postMessage(mountListeners.at(i), message);
    }
}

void FNFileSystem::setLastPath(const FNPath* path)
{
    FNPath* copy = path ? new FNPath(*path) : nullptr;
    if (lastPath)
        lastPath->release();
    lastPath = copy;
}
