#pragma once

#include "foundation/object/cmobject.h"
#include "storage/stream/fopenflags.h"

class CmTime;
class FFileIterator;
class FPath;
class FStream;
class FString;
class UProgressHook;

/// The contract of everything that holds files: the disk, an archive, a part of either.
///
/// Operations give false, null or -1 where they fail; an `error`, where given, then takes the system's
/// number, and is left alone otherwise. The base class can do nothing but what the others amount to.
class FFileSystem : public CmObject
{
    DECLARE_ABSTRACT_CLASS(FFileSystem, CmObject)

    /// `flags` are those of FOpenFlags. The caller closes the stream by `closeFile`.
    virtual FStream* createFile(FPath* path, int flags, int* error);
    virtual FStream* openFile(FPath* path, int flags, int* error);
    /// Closes and releases. False where what was written to the stream may not have arrived whole.
    virtual bool closeFile(FStream* stream);
    virtual bool removeFile(FPath* path);
    /// False for a folder.
    virtual bool fileExists(FPath* path);
    /// `path` takes the new name; on failure it keeps the old one.
    virtual bool renameFile(FPath* path, const char16* newName);
    /// With `updateSource`, `from` takes the new location.
    virtual bool moveFile(FPath* from, FPath* to, bool updateSource);
    /// A hook that is cancelled ends the copying with false; what was copied is removed.
    virtual bool copyFile(FPath* from, FPath* to, UProgressHook* hook, int* error);
    virtual bool createDir(FPath* path);
    virtual bool changeDir(FPath* path);
    virtual bool getDirName(FPath* path, FString& result);
    virtual bool removeDir(FPath* path, bool recursive);
    virtual bool getFileTimes(FPath* path, CmTime& created, CmTime& modified);
    /// In bytes; -1 where there is no such file.
    virtual int64 getFileSize(FPath* path);
    virtual int64 getFileSize(FStream* stream);
    /// An icon belongs to the window system; null without one.
    virtual CmObject* getFileIcon(FPath* path);
    /// Makes a name valid; true if anything changed.
    virtual bool makeValidName(FString& name, char16 replacement, bool trim);
    /// Over the content of a folder; the caller deletes it by `release`.
    virtual FFileIterator* newIterator(const FPath* path, bool recursive);
    /// Adds up the files, and with `withFolders` the folders too, and their bytes in `bytes`, which may be
    /// null.
    virtual int64 countFiles(const FPath* path, bool recursive, bool withFolders, int64* bytes);
    /// Whether the file's bytes are kept as they are; false for one that is compressed.
    virtual bool isBitwiseCopyable(FPath* path);

    /// What `makeValidName` does for names that the disk takes.
    static bool replaceInvalid(FString& name, char16 replacement, bool trim);
    /// Copies all bytes, telling `hook` of them. The streams stay open.
    static bool copyContent(FStream& from, FStream& to, UProgressHook* hook);
};
