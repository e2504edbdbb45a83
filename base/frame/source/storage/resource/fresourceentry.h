#pragma once

#include "storage/resource/ffilearchivenode.h"

/// A file or folder of a resource file, as its table has it.
class FResourceEntry : public FFileArchiveNode
{
    DECLARE_CLASS(FResourceEntry, FFileArchiveNode)

    enum Flags : uint32
    {
        kFolder = 1,
        kFile = 2,
        kCompressed = 4,
        kUtf8Name = 8 ///< of the stored form alone
    };

    FResourceEntry() = default;
    FResourceEntry(const ConstString& name, uint32 itsFlags);

    bool isFolder() const override { return (flags & kFolder) != 0; }
    bool isCompressed() const { return (flags & kCompressed) != 0; }
    int64 getDataOffset() const override { return dataOffset; }
    int64 getDataSize() const override { return dataSize; }
    int64 getFileSize() const override { return uncompressedSize; }
    const FString& getName() const override { return fileName; }

    uint32 getFlags() const { return flags; }
    void setName(const ConstString& name);
    void setDataOffset(int64 offset) { dataOffset = offset; }
    /// The content is stored as it is.
    void setPlain(int64 size);
    void setCompressed(int64 storedSize, int64 plainSize);

private:
    uint32 flags = kFile;
    int64 dataOffset = 0;
    int64 dataSize = 0;
    int64 uncompressedSize = 0;
    FString fileName;
};
