#pragma once

#include "foundation/object/iptr.h"
#include "foundation/text/fstring.h"
#include "storage/filesystem/ffilesystem.h"

/// One registered archive: a file system by name. The archive manager guards it.
class ArchiveEntry : public CmObject
{
    DECLARE_TYPE(ArchiveEntry, CmObject)

    /// The key is put in upper case. Null for an empty name or key, and without a file system. The caller gets the
    /// reference; the entry adds one to the file system.
    static ArchiveEntry* create(FFileSystem* files, const FString& entryName, const FString& entryKey);

    /// Null: an archive is registered once.
    CmObject* newCopy() const override { return nullptr; }

    const FString& getName() const { return name; }
    /// In upper case, and wide.
    const FString& getKey() const { return key; }
    FFileSystem* getFileSystem() const { return fileSystem; }
    int32 getUseCount() const { return useCount; }
    /// Another registration counts.
    void use() { useCount++; }
    /// True where that was the last one.
    bool unuse() { return --useCount <= 0; }

    /// A name as a key.
    static FString keyOf(const FString& text);
    static unsigned hashKey(const FString& wideText, unsigned size);

private:
    ArchiveEntry() = default;

    FString name;
    FString key;
    IPtr<FFileSystem> fileSystem;
    int32 useCount = 1;
};
