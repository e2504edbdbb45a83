#pragma once

#include "foundation/object/types.h"

class FStream;

/// The four letters of a file's last bytes as the number that is stored.
constexpr int32 resourceMagic(const char (&letters)[5])
{
    uint32 magic = 0;
    for (int i = 3; i >= 0; i--)
        magic = (magic << 8) | static_cast<uint8>(letters[i]);
    return static_cast<int32>(magic);
}

/// A format that a host adds: what its files end with, and which version of the table they have.
struct ArchiveFormatDesc
{
    int32 magic = 0;
    int16 version = 0;
    /// Whether new files of the version get this magic.
    bool forWriting = false;

    bool operator==(const ArchiveFormatDesc&) const = default;
};

/// What a resource file ends with.
struct ResourceFileEnding
{
    static constexpr int kIdSize = 32;

    /// False where the stream ends early. The older version has no identifier.
    bool read(FStream& stream, int version);
    bool write(FStream& stream, int version) const;

    /// The engine's identifier as text without a terminator; all zero for none.
    char compressionId[kIdSize] = {};
    uint32 tableSize = 0;
    /// Also counts the entries that close folders.
    uint32 entryCount = 0;
    uint32 endingSize = 0;
    int32 magic = 0;
};

/// What resource files begin with, without a terminator.
inline constexpr char kResourceHeader[] = "Vellamoor Resource File\r\n";
inline constexpr int kResourceHeaderSize = sizeof(kResourceHeader) - 1;

/// Versions of the table; above kWideVersion they belong to hosts.
inline constexpr int kFirstVersion = 1;
/// From here on the ending names an engine.
inline constexpr int kCompressionVersion = 2;
/// From here on offsets and sizes have 64 bits.
inline constexpr int kWideVersion = 3;

/// The version to write, where it is above kWideVersion; a host sets it during start-up.
extern int gFormatVersion;

/// Adds a format, during start-up. `forWriting` makes it the one in which files of the version are written.
void registerArchiveFormat(int32 magic, int16 version, bool forWriting);

/// 0 for a magic that nobody knows.
int getMagicVersion(int32 magic);
/// That of the newest known form for a version that nobody has.
int32 getVersionMagic(int version);
/// The bytes of the ending.
int getVersionSize(int version);
/// The bytes of an offset or a size.
int getNumberSize(int version);
