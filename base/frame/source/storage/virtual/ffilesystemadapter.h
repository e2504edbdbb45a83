#pragma once

#include "foundation/object/iptr.h"
#include "foundation/thread/flock.h"
#include "storage/filesystem/ffilesystem.h"
#include "storage/virtual/fremovablefilesystem.h"
#include "storage/virtual/ivirtualfilesystem.h"

class IAttributes;
class IBStream;

/// A component's file system as one of the framework.
///
/// Paths may be URLs, whose escapes are resolved. What the component says it can't do isn't asked of it. *Thread-safe*
/// for opening, closing and unmounting; all else is asked by one thread at a time.
class FFileSystemAdapter : public FFileSystem, public FRemovableFileSystem
{
    DECLARE_TYPE(FFileSystemAdapter, FFileSystem)
    FORWARD_FUNKNOWN(FFileSystem)

    /// Adds a reference.
    explicit FFileSystemAdapter(IVirtualFileSystem* itsPlugin);
    FFileSystemAdapter(const FFileSystemAdapter&) = delete;
    FFileSystemAdapter& operator=(const FFileSystemAdapter&) = delete;
    ~FFileSystemAdapter() override;
    CmObject* newCopy() const override { return nullptr; }

    bool isIterable() const { return canIterate; }
    bool isReadable() const { return canRead; }
    bool isWritable() const { return canWrite; }

    /// A path as components take it; false where there is none.
    static bool getPathFromUrl(const FPath* path, FString& result);
    /// Called when a stream is gone; the pointer says only which it was.
    void notifyStreamDestruction(IBStream* stream);
    /// "1.465 KB", for the user.
    static void makeFileSizeString(double bytes, FString& result);

    FStream* createFile(FPath* path, int flags, int* error) override;
    FStream* openFile(FPath* path, int flags, int* error) override;
    bool removeFile(FPath* path) override;
    bool fileExists(FPath* path) override;
    bool renameFile(FPath* path, const char16* newName) override;
    bool moveFile(FPath* from, FPath* to, bool updateSource) override;
    /// Paths into mounted archives are taken too, and then the other one is any.
    bool copyFile(FPath* from, FPath* to, UProgressHook* hook, int* error) override;
    bool createDir(FPath* path) override;
    bool removeDir(FPath* path, bool recursive) override;
    bool getDirName(FPath* path, FString& result) override;
    int64 getFileSize(FPath* path) override;
    using FFileSystem::getFileSize;
    /// Gives URLs where `path` is one.
    FFileIterator* newIterator(const FPath* path, bool recursive) override;
    /// The component's form isn't known: always false.
    bool isBitwiseCopyable(FPath*) override { return false; }

    FFileSystem* getFileSystem() override { return this; }
    bool unmount() override;
    int32 queryInterface(const char* interfaceID, void** object) override;

private:
    using Opening = int32 (IVirtualFileSystem::*)(const char16* path, int flags, IBStream** stream);
    using Change = int32 (IVirtualFileSystem::*)(const char16* path);

    IPtr<IVirtualFileSystem> mountedPlugin();
    FStream* open(Opening opening, FPath* path, int flags);
    bool change(Change operation, FPath* path);

    IPtr<IVirtualFileSystem> plugin;
    bool canIterate = false;
    bool canRead = false;
    bool canWrite = false;
    FLock lock{"file system of a component"};
    int openStreams = 0;
};
