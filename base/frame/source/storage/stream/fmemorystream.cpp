#include "storage/stream/fmemorystream.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <utility>

DEFINE_CLASS(FMemoryStream, FStream)

namespace
{
constexpr int64 kPage = 4096;

/// A sum that wraps: a position may have been sought to anywhere.
int64 sum(int64 a, int64 b)
{
    return static_cast<int64>(static_cast<uint64>(a) + static_cast<uint64>(b));
}

int64 wholePages(int64 bytes)
{
    constexpr int64 kMax = std::numeric_limits<int64>::max();
    return bytes > kMax - kPage ? kMax : ((bytes - 1) & -kPage) + kPage;
}

/// Most transfers are single numbers: of a known size they are one move each, without a call.
void transfer(void* target, const void* source, int64 count)
{
    switch (count)
    {
    case 1:
        memcpy(target, source, 1);
        break;
    case 2:
        memcpy(target, source, 2);
        break;
    case 4:
        memcpy(target, source, 4);
        break;
    case 8:
        memcpy(target, source, 8);
        break;
    default:
        memcpy(target, source, static_cast<size_t>(count));
        break;
    }
}
} // namespace

FMemoryStream::FMemoryStream(void* memory, int64 length)
    : data(static_cast<char*>(memory)),
      allocated(length),
      size(length),
      ownsMemory(false)
{
}

FMemoryStream::FMemoryStream(const FMemoryStream& other)
    : IBStream(other),
      FStream(other),
      ISizeableStream(other),
      IMemoryStream(other)
{
    copyBytes(other);
}

FMemoryStream::~FMemoryStream()
{
    dropBlock();
}

FMemoryStream& FMemoryStream::operator=(const FMemoryStream& other)
{
    if (this == &other)
        return *this;
    FStream::operator=(other);
    copyBytes(other);
    return *this;
}

void FMemoryStream::copyBytes(const FMemoryStream& other)
{
    dropBlock();
    ownsMemory = true;
    allocationError = false;
    cursor = 0;
    writeRaw(other.data, other.storedSize());
}

void FMemoryStream::dropBlock()
{
    if (ownsMemory)
        free(data);
    data = nullptr;
    allocated = size = 0;
}

bool FMemoryStream::setSize(int64 newSize)
{
    if (newSize <= 0)
    {
        dropBlock();
        cursor = 0;
        return true;
    }
    if (!reallocate(wholePages(std::max(newSize, allocated))))
    {
        allocationError = true;
        return false;
    }
    size = newSize;
    return true;
}

bool FMemoryStream::reallocate(int64 newAllocation)
{
    if (newAllocation == allocated)
        return true;
    if (!ownsMemory)
        return false;

    const auto bytes = static_cast<size_t>(newAllocation);
    auto* block = static_cast<char*>(realloc(data, bytes));
    if (!block)
    {
        block = static_cast<char*>(malloc(bytes));
        if (block && data)
            memcpy(block, data, static_cast<size_t>(size));
        dropBlock();
    }
    data = block;
    if (!data)
    {
        cursor = 0;
        return false;
    }
    allocated = newAllocation;
    return true;
}

bool FMemoryStream::includeEnd(int64 end)
{
    const int64 oldSize = size;
    if (end <= allocated)
        size = end;
    else if (!setSize(end))
        return false;
    // A gap that was sought over reads as zeros.
    if (cursor > oldSize)
        memset(data + oldSize, 0, static_cast<size_t>(std::min(cursor, size) - oldSize));
    return true;
}

int64 FMemoryStream::writeRaw(const void* source, int64 count)
{
    if (allocationError)
        return 0;
    const int64 end = sum(cursor, count);
    if (end > size && !includeEnd(end))
        return 0;
    if (!data || cursor < 0 || !source || count < 1 || end < cursor)
        return 0;
    transfer(data + cursor, source, count);
    cursor = end;
    return count;
}

int64 FMemoryStream::readRaw(void* target, int64 count)
{
    if (!data || !target || cursor < 0 || count < 1)
        return 0;
    if (cursor >= size)
    {
        cursor = size;
        return 0;
    }
    const int64 taken = std::min(count, size - cursor);
    transfer(target, data + cursor, taken);
    cursor += taken;
    return taken;
}

int64 FMemoryStream::seek(int64 position, FSeekMode mode)
{
    switch (mode)
    {
    case kSeekStart:
        cursor = position;
        break;
    case kSeekCurrent:
        cursor = sum(cursor, position);
        break;
    case kSeekEnd:
        cursor = position > 0 ? size : size + position;
        break;
    }
    return cursor;
}

void* FMemoryStream::pass()
{
    ownsMemory = true;
    allocationError = false;
    cursor = 0;
    allocated = 0;
    return std::exchange(data, nullptr);
}

void FMemoryStream::reset()
{
    cursor = 0;
    size = 0;
}

void FMemoryStream::takeOver(FMemoryStream& other)
{
    if (this == &other)
        return;
    dropBlock();
    data = std::exchange(other.data, nullptr);
    allocated = std::exchange(other.allocated, 0);
    size = std::exchange(other.size, 0);
    ownsMemory = std::exchange(other.ownsMemory, true);
    allocationError = std::exchange(other.allocationError, false);
    cursor = std::exchange(other.cursor, 0);
    byteOrder = other.byteOrder;
}

bool FMemoryStream::truncate()
{
    if (!ownsMemory)
        return false;
    if (size == allocated || !data)
        return true;
    if (size <= 0)
    {
        dropBlock();
        return true;
    }
    if (auto* block = static_cast<char*>(realloc(data, static_cast<size_t>(size))))
    {
        data = block;
        allocated = size;
    }
    return true;
}

bool FMemoryStream::truncateToCursor()
{
    size = std::clamp<int64>(cursor, 0, allocated);
    return truncate();
}

bool FMemoryStream::read(FStream& from, uint32 count)
{
    const int64 oldSize = size;
    const int64 end = sum(cursor, count);
    if (cursor < 0 || end < cursor || (end > size && !includeEnd(end)))
        return false;
    auto* memory = FCast(FMemoryStream, &from);
    if (!memory)
        return FStream::read(from, count);

    const int64 rest = memory->cursor < 0 ? 0 : std::max<int64>(memory->size - memory->cursor, 0);
    const int64 taken = rest > 0 ? writeRaw(memory->data + memory->cursor, std::min<int64>(rest, count)) : 0;
    memory->seek(taken, kSeekCurrent);
    // What the other stream didn't have.
    if (const int64 unset = std::max(cursor, oldSize); unset < size)
        memset(data + unset, 0, static_cast<size_t>(size - unset));
    return taken == count;
}

bool FMemoryStream::copyTo(FStream& to)
{
    rewind();
    const int64 stored = storedSize();
    return stored == 0 || to.writeRaw(data, stored) == stored;
}

int32 FMemoryStream::getStreamSize(int64& result)
{
    result = size;
    return kResultOk;
}

int32 FMemoryStream::setStreamSize(int64 newSize)
{
    setSize(newSize);
    return allocationError ? kStreamSizeNotChanged : kResultOk;
}

int32 FMemoryStream::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, ISizeableStream::iid))
        return offerInterface<ISizeableStream>(this, object);
    if (isSameInterface(interfaceID, IMemoryStream::iid))
        return offerInterface<IMemoryStream>(this, object);
    return FStream::queryInterface(interfaceID, object);
}
