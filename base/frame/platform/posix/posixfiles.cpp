#include "storage/filesystem/platformfiles.h"

#include <cerrno>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/statfs.h>
#include <unistd.h>

// Open files.

namespace
{
constexpr mode_t kRightsOfAll = 0666;
constexpr mode_t kRightsOfOwner = 0600;

int accessOf(const PlatformFiles::Opening& how)
{
    if (how.read && how.write)
        return O_RDWR;
    return how.write ? O_WRONLY : O_RDONLY;
}

int flagsOf(const PlatformFiles::Opening& how)
{
    // A pipe without anybody at its other end would block the program for ever; plain files don't mind the
    // flag.
    int flags = accessOf(how) | O_CLOEXEC | O_NONBLOCK | O_NOCTTY;
    if (how.create)
        flags |= O_CREAT;
    if (how.truncate)
        flags |= O_TRUNC;
    return flags;
}

bool isFolder(int descriptor)
{
    struct stat facts = {};
    return fstat(descriptor, &facts) == 0 && S_ISDIR(facts.st_mode);
}

// A folder can be opened for reading, but not read.
int refuseFolder(int descriptor)
{
    return isFolder(descriptor) ? EISDIR : 0;
}

int failOpening(int descriptor, int reason, int& error)
{
    error = reason;
    ::close(descriptor);
    return -1;
}

template <class Transfer>
int64 repeatWhileInterrupted(Transfer transfer, int& error)
{
    for (;;)
    {
        const ssize_t moved = transfer();
        if (moved >= 0)
            return moved;
        if (errno != EINTR)
        {
            error = errno;
            return -1;
        }
    }
}
} // namespace

int PlatformFiles::open(const std::string& path, const Opening& how, int& error)
{
    const int descriptor = ::open(path.c_str(), flagsOf(how), how.ownerOnly ? kRightsOfOwner : kRightsOfAll);
    if (descriptor < 0)
    {
        error = errno;
        return -1;
    }
    if (const int reason = refuseFolder(descriptor))
        return failOpening(descriptor, reason, error);
    if (how.ownerOnly && fchmod(descriptor, kRightsOfOwner) != 0)
        return failOpening(descriptor, errno, error);
    // A hint: what passes needn't stay in the system's cache.
    if (how.unbuffered)
        (void)posix_fadvise(descriptor, 0, 0, POSIX_FADV_NOREUSE);
    return descriptor;
}

std::FILE* PlatformFiles::openBuffered(int descriptor, const char* mode, std::size_t bufferSize)
{
    std::FILE* file = fdopen(descriptor, mode);
    if (file)
        setvbuf(file, nullptr, _IOFBF, bufferSize);
    return file;
}

int PlatformFiles::close(int descriptor)
{
    return ::close(descriptor) == 0 ? 0 : errno;
}

int64 PlatformFiles::read(int descriptor, void* buffer, int64 count, int& error)
{
    return repeatWhileInterrupted([&] { return ::read(descriptor, buffer, static_cast<size_t>(count)); },
                                  error);
}

int64 PlatformFiles::write(int descriptor, const void* buffer, int64 count, int& error)
{
    return repeatWhileInterrupted([&] { return ::write(descriptor, buffer, static_cast<size_t>(count)); },
                                  error);
}

int64 PlatformFiles::seek(int descriptor, int64 position, int origin)
{
    return lseek(descriptor, position, origin);
}

int64 PlatformFiles::seek(std::FILE* file, int64 position, int origin)
{
    return fseeko(file, position, origin) == 0 ? ftello(file) : -1;
}

int64 PlatformFiles::tell(std::FILE* file)
{
    return ftello(file);
}

int PlatformFiles::descriptorOf(std::FILE* file)
{
    return fileno(file);
}

int64 PlatformFiles::sizeOf(int descriptor)
{
    struct stat facts = {};
    return fstat(descriptor, &facts) == 0 ? facts.st_size : -1;
}

int PlatformFiles::setSize(int descriptor, int64 size)
{
    return ftruncate(descriptor, size) == 0 ? 0 : errno;
}

int32 PlatformFiles::blockSizeOf(int descriptor)
{
    struct statfs facts = {};
    return fstatfs(descriptor, &facts) == 0 ? static_cast<int32>(facts.f_bsize) : 0;
}

int64 PlatformFiles::reserve(int descriptor, int64 position, int64 count)
{
    return fallocate(descriptor, FALLOC_FL_KEEP_SIZE, position, count) == 0 ? count : 0;
}

int PlatformFiles::sync(int descriptor)
{
    if (fsync(descriptor) == 0)
        return 0;
    // What has no disk behind it, as a pipe, can't be forced there.
    return errno == EINVAL ? 0 : errno;
}
