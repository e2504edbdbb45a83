#include "storage/resource/resourceformat.h"

#include "containers/typed/tarray.h"
#include "storage/stream/fstream.h"

int gFormatVersion = 0;

namespace
{
constexpr ArchiveFormatDesc kOwnFormats[] = {{resourceMagic("QZRF"), kFirstVersion, true},
                                             {resourceMagic("QZR2"), kCompressionVersion, true},
                                             {resourceMagic("QZR3"), kWideVersion, true}};

/// Those that hosts have added.
TArray<ArchiveFormatDesc>& gArchiveFormats()
{
    static auto* const formats = new TArray<ArchiveFormatDesc>(0, 10);
    return *formats;
}
} // namespace

void registerArchiveFormat(int32 magic, int16 version, bool forWriting)
{
    gArchiveFormats().add({magic, version, forWriting});
}

int getMagicVersion(int32 magic)
{
    for (const ArchiveFormatDesc& format : kOwnFormats)
        if (format.magic == magic)
            return format.version;
    for (const ArchiveFormatDesc& format : gArchiveFormats())
        if (format.magic == magic && format.version >= kFirstVersion)
            return format.version;
    return 0;
}

int32 getVersionMagic(int version)
{
    for (const ArchiveFormatDesc& format : gArchiveFormats())
        if (format.forWriting && format.version == version)
            return format.magic;
    for (const ArchiveFormatDesc& format : kOwnFormats)
        if (format.version == version)
            return format.magic;
    return resourceMagic("QZR3");
}

int getVersionSize(int version)
{
    return version < kCompressionVersion ? 16 : 48;
}

int getNumberSize(int version)
{
    return version < kWideVersion ? 4 : 8;
}

bool ResourceFileEnding::read(FStream& stream, int version)
{
    if (version >= kCompressionVersion && stream.readRaw(compressionId, kIdSize) != kIdSize)
        return false;
    return stream.readInt32u(tableSize) && stream.readInt32u(entryCount) && stream.readInt32u(endingSize) &&
           stream.readInt32(magic);
}

bool ResourceFileEnding::write(FStream& stream, int version) const
{
    if (version >= kCompressionVersion && stream.writeRaw(compressionId, kIdSize) != kIdSize)
        return false;
    return stream.writeInt32u(tableSize) && stream.writeInt32u(entryCount) &&
           stream.writeInt32u(endingSize) && stream.writeInt32(magic);
}
