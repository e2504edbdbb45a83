#pragma once

#include "foundation/object/types.h"

#include <cstdio>
#include <string>
#include <vector>

/// Files and folders as the platform has them, by paths of bytes. Defined by the platform; thread-safe.
///
/// An operation that can fail gives 0 or the platform's error number, unless it says otherwise.
namespace PlatformFiles
{
enum class Kind
{
    kMissing,
    kFile,
    kFolder,
    kOther ///< a device, a pipe, a socket
};

struct Facts
{
    Kind kind = Kind::kMissing;
    bool isLink = false; ///< the path is a link; all else tells of what it leads to
    int64 size = 0;
    int64 created = 0; ///< seconds since 1 January 1970, Greenwich; that of the change where it isn't known
    int64 modified = 0;
    uint32 mode = 0;
};

struct Opening
{
    bool read = false;
    bool write = false;
    bool create = false;
    bool truncate = false;
    bool ownerOnly =
        false; ///< readable and writable by its owner and nobody else, also where it exists already
    bool unbuffered = false;
};

/// A link that leads nowhere is kMissing, and isLink.
Facts look(const std::string& path);
/// Whether there is anything of that name, be it a link that leads nowhere.
bool isTaken(const std::string& path);

// Open files. `open` gives a descriptor, or -1 and the error.
int open(const std::string& path, const Opening& how, int& error);
/// The file takes the descriptor over; null where that fails. `mode` is that of the standard library and must
/// fit the opening; it truncates nothing here.
std::FILE* openBuffered(int descriptor, const char* mode, std::size_t bufferSize);
int close(int descriptor);
/// These give the number of bytes, or -1 with the error in `error`.
int64 read(int descriptor, void* buffer, int64 count, int& error);
int64 write(int descriptor, const void* buffer, int64 count, int& error);
/// `origin` is SEEK_SET, SEEK_CUR or SEEK_END. -1 where it fails.
int64 seek(int descriptor, int64 position, int origin);
int64 seek(std::FILE* file, int64 position, int origin);
int64 tell(std::FILE* file);
int descriptorOf(std::FILE* file);
/// -1 where it can't be told.
int64 sizeOf(int descriptor);
int setSize(int descriptor, int64 size);
int32 blockSizeOf(int descriptor);
/// Reserves room behind the end without making the file longer; gives the bytes that it got, 0 on failure.
int64 reserve(int descriptor, int64 position, int64 count);
/// Forces the content to the disk.
int sync(int descriptor);

// Names
int removeFile(const std::string& path);
int removeFolder(const std::string& path);
int makeFolder(const std::string& path, bool ownerOnly);
/// Replaces what is at `to`.
int rename(const std::string& from, const std::string& to);
bool isAcrossDevices(int error);
int changeFolder(const std::string& path);
/// Forces to the disk which names the folder holds.
int syncFolder(const std::string& path);
/// The names in a folder but "." and "..", in the order of their bytes; false where it can't be read.
bool list(const std::string& path, std::vector<std::string>& names);

// Links
int makeSymlink(const std::string& path, const std::string& target);
int makeLink(const std::string& path, const std::string& target);
bool readSymlink(const std::string& path, std::string& target);
/// The path of what a link leads to in the end.
bool resolve(const std::string& path, std::string& target);

// Rights and times
bool isWritable(const std::string& path);
int setWritable(const std::string& path, bool state);
/// A file that can be run as a program.
bool isExecutable(const std::string& path);
/// Whether both paths lead to the same thing on disk.
bool isSame(const std::string& left, const std::string& right);
/// Gives `to` the rights of `from`.
int copyRights(const std::string& from, const std::string& to);
/// The same, and the time of its last change.
int copyAttributes(const std::string& from, const std::string& to);

// Volumes
enum class Medium
{
    kFixed,
    kRemovable,
    kOptical,
    kNetwork
};
struct Volume
{
    std::string mountPoint;
    Medium medium = Medium::kFixed;
};
/// Those that a user would call drives, the root first.
std::vector<Volume> listVolumes();
Medium mediumOf(const std::string& path);
bool freeBytes(const std::string& path, uint64& available, uint64& total);

/// What an error number means, by the words of the platform.
enum class Trouble
{
    kNone,
    kNotFound,
    kReadWrite,
    kNameTooLong,
    kDiskFull,
    kReadOnly,
    kNotAllowed,
    kOther
};
Trouble meaningOf(int error);
std::string describe(int error);
} // namespace PlatformFiles
