#include "storage/virtual/ffilesystemadapter.h"

#include "foundation/thread/flockscope.h"
#include "storage/attribute/fattributes.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/url/furl.h"
#include "storage/virtual/archivecopy.h"
#include "storage/virtual/ffileiteratorurlwrapper.h"
#include "storage/virtual/ffilesysiteratoradapter.h"
#include "storage/virtual/fpluginstreamproxy.h"
#include "storage/virtual/innerpath.h"

DEFINE_INTERFACE_ID(IVirtualFileSystem, 0x0F4D82B7, 0xE1954C36, 0xA85B3D70, 0x97C2E164)
DEFINE_INTERFACE_ID(IVirtualFileIterator, 0x7A3590DE, 0x4C284F1B, 0x86E7B10F, 0x2D9F55A8)

FFileSystemAdapter::FFileSystemAdapter(IVirtualFileSystem* itsPlugin) : plugin(itsPlugin)
{
    const IPtr<FAttributes> description = adopt(new FAttributes);
    if (!plugin || plugin->getDescription(description) != kResultOk)
        return;
    canIterate = description->getInt("CanIterate") != 0;
    canRead = description->getInt("CanRead") != 0;
    canWrite = description->getInt("CanWrite") != 0;
}

FFileSystemAdapter::~FFileSystemAdapter() = default;

int32 FFileSystemAdapter::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, FRemovableFileSystem::iid))
        return offerInterface<FRemovableFileSystem>(this, object);
    return FFileSystem::queryInterface(interfaceID, object);
}

bool FFileSystemAdapter::getPathFromUrl(const FPath* path, FString& result)
{
    if (!path)
        return false;
    result = InnerPath::textOf(*path);
    if (!FCast(FUrl, path))
        return !result.isEmpty();
    FUrl::urlDecode(result);
    result.toWideString();
    const char16 foreign[] = {kUnixDelimiter, 0};
    result.replaceChars16(foreign, PATH_DELIMITER);
    return !result.isEmpty();
}

void FFileSystemAdapter::makeFileSizeString(double bytes, FString& result)
{
    FNFileSystem::makeFileSizeString(bytes, result, -1);
}

// Mounting

IPtr<IVirtualFileSystem> FFileSystemAdapter::mountedPlugin()
{
    FLockScope guard(lock);
    return plugin;
}

bool FFileSystemAdapter::unmount()
{
    IPtr<IVirtualFileSystem> leaving;
    {
        FLockScope guard(lock);
        if (openStreams > 0)
            return false;
        leaving = plugin;
        plugin = nullptr;
    }
    if (!leaving || leaving->unmount() == kResultOk)
        return true;
    FLockScope guard(lock);
    plugin = leaving;
    return false;
}

void FFileSystemAdapter::notifyStreamDestruction(IBStream*)
{
    FLockScope guard(lock);
    openStreams--;
}

// Streams

FStream* FFileSystemAdapter::open(Opening opening, FPath* path, int flags)
{
    FString text;
    if (!getPathFromUrl(path, text))
        return nullptr;
    IPtr<IVirtualFileSystem> asked;
    {
        // Counted before it is asked, so that nobody unmounts in between.
        FLockScope guard(lock);
        if (!plugin)
            return nullptr;
        asked = plugin;
        openStreams++;
    }
    IBStream* stream = nullptr;
    if ((asked->*opening)(text.text16(), flags, &stream) == kResultOk && stream)
        return new FPluginStreamProxy(adopt(stream), this);
    notifyStreamDestruction(nullptr);
    return nullptr;
}

FStream* FFileSystemAdapter::createFile(FPath* path, int flags, int*)
{
    return canWrite ? open(&IVirtualFileSystem::createFile, path, flags) : nullptr;
}

FStream* FFileSystemAdapter::openFile(FPath* path, int flags, int*)
{
    const bool isToWrite = (flags & (kFileWrite | kFileReadWrite)) != 0;
    if (!canRead || (isToWrite && !canWrite))
        return nullptr;
    return open(&IVirtualFileSystem::openFile, path, flags);
}

// Files and folders

bool FFileSystemAdapter::change(Change operation, FPath* path)
{
    const IPtr<IVirtualFileSystem> asked = mountedPlugin();
    FString text;
    return canWrite && asked && getPathFromUrl(path, text) && (asked->*operation)(text.text16()) == kResultOk;
}

bool FFileSystemAdapter::removeFile(FPath* path)
{
    return change(&IVirtualFileSystem::removeFile, path);
}

bool FFileSystemAdapter::createDir(FPath* path)
{
    return change(&IVirtualFileSystem::createFolder, path);
}

bool FFileSystemAdapter::removeDir(FPath* path, bool recursive)
{
    const IPtr<IVirtualFileSystem> asked = mountedPlugin();
    FString text;
    return canWrite && asked && getPathFromUrl(path, text) &&
           asked->removeFolder(text.text16(), recursive) == kResultOk;
}

bool FFileSystemAdapter::getDirName(FPath* path, FString& result)
{
    return path && InnerPath::getDirName(*path, result);
}

bool FFileSystemAdapter::fileExists(FPath* path)
{
    const IPtr<IVirtualFileSystem> asked = mountedPlugin();
    FString text;
    return asked && getPathFromUrl(path, text) && asked->fileExists(text.text16()) == kResultOk;
}

bool FFileSystemAdapter::renameFile(FPath* path, const char16* newName)
{
    const IPtr<IVirtualFileSystem> asked = mountedPlugin();
    FString text;
    if (!canWrite || !asked || !newName || !getPathFromUrl(path, text) ||
        asked->renameFile(text.text16(), newName) != kResultOk)
        return false;
    path->setName(newName);
    return true;
}

bool FFileSystemAdapter::moveFile(FPath* from, FPath* to, bool updateSource)
{
    const IPtr<IVirtualFileSystem> asked = mountedPlugin();
    FString source;
    FString target;
    if (!canWrite || !asked || !getPathFromUrl(from, source) || !getPathFromUrl(to, target) ||
        asked->moveFile(source.text16(), target.text16()) != kResultOk)
        return false;
    if (updateSource)
        from->fromString(InnerPath::textOf(*to).text16(), to->getPathType());
    return true;
}

bool FFileSystemAdapter::copyFile(FPath* from, FPath* to, UProgressHook* hook, int* error)
{
    if (isInArchive(from) || isInArchive(to))
        return copyAcrossArchives(from, to, hook, error);
    return FFileSystem::copyFile(from, to, hook, error);
}

int64 FFileSystemAdapter::getFileSize(FPath* path)
{
    const IPtr<IVirtualFileSystem> asked = mountedPlugin();
    FString text;
    int64 size = -1;
    if (!asked || !getPathFromUrl(path, text) || asked->getFileSize(text.text16(), &size) != kResultOk)
        return -1;
    return size;
}

FFileIterator* FFileSystemAdapter::newIterator(const FPath* path, bool recursive)
{
    const IPtr<IVirtualFileSystem> asked = mountedPlugin();
    FString text;
    IVirtualFileIterator* walk = nullptr;
    if (!canIterate || !asked || !getPathFromUrl(path, text) ||
        asked->newIterator(text.text16(), recursive, &walk) != kResultOk || !walk)
        return nullptr;
    auto* adapter = new FFileSysIteratorAdapter(adopt(walk));
    const FUrl* url = FCast(FUrl, path);
    return url ? static_cast<FFileIterator*>(new FFileIteratorUrlWrapper(adapter, *url)) : adapter;
}
