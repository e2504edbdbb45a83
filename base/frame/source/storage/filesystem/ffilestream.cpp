#include "storage/stream/ffilestream.h"

#include "foundation/text/fstring.h"
#include "storage/filesystem/filesystemchange.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/filesystem/platformfiles.h"
#include "storage/path/fnpath.h"
#include "storage/stream/uprogresshook.h"

#include <algorithm>
#include <cerrno>

namespace
{
constexpr std::size_t kBufferSize = 16384;
constexpr int64 kPreallocation = 8388608;

constexpr std::int8_t kUnknown = -1;
constexpr std::int8_t kRead = 1;
constexpr std::int8_t kWrite = 2;

// By FSeekMode.
constexpr int kSeekOrigins[] = {SEEK_SET, SEEK_CUR, SEEK_END};
} // namespace

FFileStream::FFileStream(int openFlags) : mode(openFlags) {}

FFileStream::~FFileStream()
{
    if (isValid())
    {
        close();
        if (isWritable() && path && gFileSystem)
            gFileSystem->onFileSystemChange(FileSystemChange::kWritten, path, nullptr);
    }
    setPath(nullptr);
}

int32 FFileStream::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, ISizeableStream::iid))
        return offerInterface<ISizeableStream>(this, object);
    return FStream::queryInterface(interfaceID, object);
}

void FFileStream::setPath(FNPath* newPath)
{
    if (newPath)
        newPath->addRef();
    if (path)
        path->release();
    path = newPath;
}

bool FFileStream::isWritable() const
{
    return (mode & (kFileWrite | kFileReadWrite)) != 0;
}

bool FFileStream::attach(int newDescriptor, const char* fileMode, int32 alignment)
{
    seekAlign = alignment;
    if (!fileMode)
    {
        descriptor = newDescriptor;
        preallocatedEnd = PlatformFiles::sizeOf(descriptor);
        return true;
    }
    file = PlatformFiles::openBuffered(newDescriptor, fileMode, kBufferSize);
    if (file)
        return true;
    setFirstError(errno);
    PlatformFiles::close(newDescriptor);
    return false;
}

// Closing

bool FFileStream::close()
{
    if (!isValid())
        return firstError == 0;
    finishWriting();
    if (file && std::fclose(file) != 0)
        setFirstError(errno);
    if (descriptor >= 0)
        setFirstError(PlatformFiles::close(descriptor));
    file = nullptr;
    descriptor = -1;
    lastOperation = kUnknown;
    return firstError == 0;
}

void FFileStream::finishWriting()
{
    if (file && isWritable() && std::fflush(file) != 0)
        setFirstError(errno);
    // What was reserved and not used goes back to the disk.
    const int64 size = descriptor >= 0 ? PlatformFiles::sizeOf(descriptor) : -1;
    if (size >= 0 && isWritable() && preallocatedEnd > size)
        setFirstError(PlatformFiles::setSize(descriptor, size));
    if (syncOnClose)
        setFirstError(PlatformFiles::sync(getFileRef()));
}

void FFileStream::flush()
{
    if (!isWritable() || !file)
        return;
    if (std::fflush(file) != 0)
        setFirstError(errno);
    lastOperation = kUnknown;
}

// Transfers

bool FFileStream::isCanceled(int64 count)
{
    if (!hook)
        return false;
    if (hook->wasCanceled())
        return true;
    hook->advance(count);
    return false;
}

// The standard library wants a file positioned between reading and writing.
void FFileStream::prepareFor(std::int8_t operation)
{
    if (lastOperation != kUnknown && lastOperation != operation)
        PlatformFiles::seek(file, PlatformFiles::tell(file), SEEK_SET);
    lastOperation = operation;
}

void FFileStream::noteFileError()
{
    // errno is that of the transfer just made: nothing else was called since.
    const int reason = errno;
    if (std::ferror(file))
        setFirstError(reason ? reason : EIO);
}

int64 FFileStream::readRaw(void* buffer, int64 count)
{
    if (!isValid() || count < 0 || isCanceled(count))
        return -1;
    if (file)
        return readFile(buffer, count);
    int error = 0;
    const int64 done = PlatformFiles::read(descriptor, buffer, count, error);
    setFirstError(error);
    if (done > 0)
        filePosition += done;
    return done;
}

int64 FFileStream::readFile(void* buffer, int64 count)
{
    prepareFor(kRead);
    errno = 0;
    const size_t done = std::fread(buffer, 1, static_cast<size_t>(count), file);
    noteFileError();
    return static_cast<int64>(done);
}

int64 FFileStream::writeRaw(const void* buffer, int64 count)
{
    if (!isValid() || count < 0 || isCanceled(count))
        return -1;
    return file ? writeFile(buffer, count) : writeDescriptor(buffer, count);
}

int64 FFileStream::writeFile(const void* buffer, int64 count)
{
    prepareFor(kWrite);
    errno = 0;
    const size_t done = std::fwrite(buffer, 1, static_cast<size_t>(count), file);
    noteFileError();
    return static_cast<int64>(done);
}

int64 FFileStream::writeDescriptor(const void* buffer, int64 count)
{
    preallocate(count);
    const char* bytes = static_cast<const char*>(buffer);
    int64 total = 0;
    int error = 0;
    // The system may take less than it is given; only a second try tells why.
    while (total < count && error == 0)
        total += std::max<int64>(PlatformFiles::write(descriptor, bytes + total, count - total, error), 0);
    setFirstError(error);
    filePosition += total;
    return total > 0 || error == 0 ? total : -1;
}

// Room for more than is written now keeps the file in one piece. A disk that can't do it only loses that.
void FFileStream::preallocate(int64 count)
{
    if ((mode & kFileDirect) && filePosition + count > preallocatedEnd)
        preallocatedEnd += PlatformFiles::reserve(descriptor, preallocatedEnd, kPreallocation);
}

// Position

int64 FFileStream::seekSystem(int64 position, int origin)
{
    lastOperation = kUnknown;
    if (file)
        return PlatformFiles::seek(file, position, origin);
    const int64 reached = PlatformFiles::seek(descriptor, position, origin);
    if (reached >= 0)
        filePosition = reached;
    return reached;
}

void FFileStream::keepHookInStep(int64 position, FSeekMode seekMode)
{
    if (!hook)
        return;
    if (seekMode == kSeekStart)
        hook->setValue(position);
    else if (seekMode == kSeekCurrent)
        hook->advance(position);
}

int64 FFileStream::seek(int64 position, FSeekMode seekMode)
{
    if (!isValid() || seekMode < kSeekStart || seekMode > kSeekEnd)
        return -1;
    // No failure of the file, and expected behind a last line without line end: nothing is stored or told.
    if (seekMode == kSeekStart && position < 0)
        return -1;
    keepHookInStep(position, seekMode);
    const int64 reached = seekSystem(position, kSeekOrigins[seekMode]);
    if (reached < 0)
        setFirstError(errno);
    return reached;
}

int64 FFileStream::tell()
{
    if (file)
        return PlatformFiles::tell(file);
    return descriptor >= 0 ? PlatformFiles::seek(descriptor, 0, SEEK_CUR) : -1;
}

void FFileStream::rewind()
{
    if (hook)
        hook->setValue(0);
    if (isValid())
        seekSystem(0, SEEK_SET);
}

void FFileStream::setReadWriteHook(UProgressHook* newHook, int)
{
    hook = newHook;
}

// Size

int64 FFileStream::getEof()
{
    if (!isValid())
        return -1;
    const int64 position = tell();
    const int64 end = seekSystem(0, SEEK_END);
    seekSystem(position, SEEK_SET);
    return end;
}

bool FFileStream::setEof(int64 position)
{
    if (!isValid() || position < 0)
        return false;
    // What is buffered must not arrive behind the new end.
    flush();
    const int error = PlatformFiles::setSize(getFileRef(), position);
    setFirstError(error);
    return error == 0;
}

int32 FFileStream::getStreamSize(int64& size)
{
    size = getEof();
    return size >= 0 ? kResultOk : kStreamFailed;
}

int32 FFileStream::setStreamSize(int64 size)
{
    return setEof(size) ? kResultOk : kStreamSizeNotChanged;
}

bool FFileStream::eof()
{
    if (file)
        return std::feof(file) != 0;
    return descriptor < 0 || PlatformFiles::sizeOf(descriptor) <= tell();
}

// Errors

void FFileStream::clearError()
{
    firstError = 0;
    if (file)
        std::clearerr(file);
}

void FFileStream::setFirstError(int systemError)
{
    if (firstError == 0)
        firstError = systemError;
}

int FFileStream::getFirstError(bool raw) const
{
    return raw ? firstError : FNFileSystem::fromPlatformErrorCode(firstError);
}

void FFileStream::getErrorMessage(FString& result) const
{
    FNFileSystem::getErrorMessage(firstError, result);
}

int FFileStream::getFileRef() const
{
    return file ? PlatformFiles::descriptorOf(file) : descriptor;
}
