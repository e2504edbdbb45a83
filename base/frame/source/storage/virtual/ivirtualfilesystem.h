#pragma once

#include "foundation/object/funknown.h"

class IAttributes;
class IBStream;
class IString;

/// A walk over files of a component; paths are full paths inside its file system. One thread at a time.
class IVirtualFileIterator : public FUnknown
{
public:
    virtual void first() = 0;
    virtual void next() = 0;
    virtual bool done() = 0;
    /// `isFolder` tells what it is. Nonzero at the end.
    virtual int32 current(IString* path, bool* isFolder) = 0;

    DECLARE_INTERFACE_ID
};

/// A format of archives that a component brings along, one opened archive an object.
///
/// Paths are full paths from the archive's root with the platform's delimiter; where the caller had a URL, they are
/// its text without escapes. Each result is 0 on success. What is opened or made belongs to the caller. Called by any
/// thread, but not by two at once.
class IVirtualFileSystem : public FUnknown
{
public:
    /// Sets "CanIterate", "CanRead" and "CanWrite" to 1 for what it does; what is missing it doesn't.
    virtual int32 getDescription(IAttributes* attributes) = 0;
    /// `flags` are those of FOpenFlags.
    virtual int32 createFile(const char16* path, int flags, IBStream** stream) = 0;
    virtual int32 openFile(const char16* path, int flags, IBStream** stream) = 0;
    virtual int32 removeFile(const char16* path) = 0;
    virtual int32 fileExists(const char16* path) = 0;
    virtual int32 renameFile(const char16* path, const char16* newName) = 0;
    virtual int32 moveFile(const char16* from, const char16* to) = 0;
    virtual int32 createFolder(const char16* path) = 0;
    virtual int32 removeFolder(const char16* path, bool recursive) = 0;
    virtual int32 getFileSize(const char16* path, int64* size) = 0;
    virtual int32 newIterator(const char16* path, bool recursive, IVirtualFileIterator** walk) = 0;
    /// After a success nothing is asked.
    virtual int32 unmount() = 0;

    DECLARE_INTERFACE_ID
};
