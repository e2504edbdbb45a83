#pragma once

#include "foundation/object/iptr.h"
#include "storage/filesystem/ffilesystem.h"
#include "storage/virtual/fvfshandler.h"

/// A folder or an archive as a file system of its own: its paths begin where it is mounted, and lead nowhere else.
///
/// A path that leaves it by ".." finds nothing. Nothing is changed unless it is writable. Operations are those of the
/// target, and so are their threads; the rows of handlers are filled during start-up, which isn't locked.
class FVFileSystem : public FFileSystem
{
    DECLARE_TYPE(FVFileSystem, FFileSystem)

    /// Adds a reference to `itsTarget`, all of which is mounted.
    FVFileSystem(FFileSystem* itsTarget, bool isWritable);
    /// Mounts a folder, or a file of a type that a handler is registered for. See `verify`.
    FVFileSystem(FPath* mounted, bool isWritable);
    FVFileSystem(const FVFileSystem&) = delete;
    FVFileSystem& operator=(const FVFileSystem&) = delete;
    ~FVFileSystem() override;
    CmObject* newCopy() const override { return nullptr; }

    /// Whether there is something to reach: a handler for the file, which could open it, or a folder on disk.
    bool verify() const;
    void enableWrite(bool state) { writable = state; }
    bool isWritable() const { return writable; }
    FFileSystem* getTarget() const { return target; }
    /// Where the mounted folder is in the target; null for all of it.
    const FPath* getRoot() const { return root; }

    /// The path inside the target; null where it leads out of what is mounted.
    IPtr<FPath> translatePath(const FPath* path) const;
    /// A path of the target as one of this file system, which begins with a delimiter; null for one elsewhere.
    IPtr<FPath> reverseTranslate(const FPath* inner) const;

    /// Files of this type are mounted by what `factory` gives. The type must live to the end of the process.
    static void registerHandler(const FFileType* type, FVfsHandler::Factory factory);

    FStream* createFile(FPath* path, int flags, int* error) override;
    /// To write only where that is allowed.
    FStream* openFile(FPath* path, int flags, int* error) override;
    bool closeFile(FStream* stream) override;
    bool removeFile(FPath* path) override;
    bool fileExists(FPath* path) override;
    bool renameFile(FPath* path, const char16* newName) override;
    bool moveFile(FPath* from, FPath* to, bool updateSource) override;
    /// Paths into mounted archives are taken too, and then the other one is any.
    bool copyFile(FPath* from, FPath* to, UProgressHook* hook, int* error) override;
    bool createDir(FPath* path) override;
    bool changeDir(FPath* path) override;
    bool getDirName(FPath* path, FString& result) override;
    bool removeDir(FPath* path, bool recursive) override;
    bool getFileTimes(FPath* path, CmTime& created, CmTime& modified) override;
    int64 getFileSize(FPath* path) override;
    int64 getFileSize(FStream* stream) override;
    CmObject* getFileIcon(FPath* path) override;
    bool makeValidName(FString& name, char16 replacement, bool trim) override;
    FFileIterator* newIterator(const FPath* path, bool recursive) override;
    int64 countFiles(const FPath* path, bool recursive, bool withFolders, int64* bytes) override;
    bool isBitwiseCopyable(FPath* path) override;

private:
    void mount(FPath& mounted);
    static IPtr<FFileSystem> mountFile(FPath& mounted);
    /// As `translatePath`, but null where nothing may be changed.
    IPtr<FPath> translateToWrite(const FPath* path) const;

    IPtr<FFileSystem> target;
    IPtr<FPath> root;
    bool writable;
};
