#include "storage/stream/fstream.h"

#include "containers/value/cmbuffer.h"

#include <algorithm>
#include <cstring>
#include <string>

DEFINE_ABSTRACT_CLASS(FStream, CmObject)

namespace
{
constexpr int64 kPiece = 1024;

void copyBlindly(FStream& from, FStream& to, int64 count)
{
    char piece[kPiece];
    for (; count > 0; count -= kPiece)
    {
        const int64 size = std::min(count, kPiece);
        const int64 got = std::max<int64>(from.readRaw(piece, size), 0);
        // What isn't there is written all the same; it must not be a piece of somebody's memory.
        memset(piece + got, 0, static_cast<size_t>(size - got));
        to.writeRaw(piece, size);
    }
}

bool copyWhole(FStream& from, FStream& to)
{
    if (from.tell() != 0)
        from.rewind();
    char piece[kPiece];
    for (;;)
    {
        const int64 got = from.readRaw(piece, kPiece);
        if (got > 0 && to.writeRaw(piece, got) < got)
            return false;
        if (got < kPiece)
            return true;
    }
}

FSeekMode toSeekMode(int mode)
{
    return mode == kSeekCurrent || mode == kSeekEnd ? static_cast<FSeekMode>(mode) : kSeekStart;
}

bool isLineEnd(char byte)
{
    return byte == '\r' || byte == '\n';
}

bool isBlank(char byte)
{
    return byte == ' ' || byte == '\t';
}

/// Finds where a line begins and ends and where the next one begins, by reading byte by byte.
class LineScan
{
public:
    LineScan(FStream& source, bool isTrimming) : position(source.tell()), stream(source), trim(isTrimming) {}

    /// False at the end of the stream.
    bool run()
    {
        first = end = position;
        if (!readByte())
            return false;
        for (bool hasCounted = false; !isLineEnd(byte);)
        {
            if (!trim || !isBlank(byte))
            {
                if (!hasCounted)
                    first = position - 1;
                hasCounted = true;
                end = position;
            }
            if (!readByte())
                return true;
        }
        do
            next = position;
        while (readByte() && isLineEnd(byte));
        return true;
    }

    int64 first = 0;
    int64 end = 0;
    /// -1 where the stream ends inside the line.
    int64 next = -1;
    int64 position;

private:
    bool readByte()
    {
        if (!stream.readChar8(byte))
            return false;
        position++;
        return true;
    }

    FStream& stream;
    bool trim;
    char byte = 0;
};
} // namespace

bool FStream::read(FStream& from, uint32 count)
{
    copyBlindly(from, *this, count);
    return true;
}

bool FStream::write(FStream& to, uint32 count)
{
    copyBlindly(*this, to, count);
    return true;
}

bool FStream::copyFrom(FStream& from)
{
    return copyWhole(from, *this);
}

bool FStream::copyTo(FStream& to)
{
    return copyWhole(*this, to);
}

bool FStream::isStreamEqual(FStream& other)
{
    if (tell() != 0)
        rewind();
    if (other.tell() != 0)
        other.rewind();
    char mine[kPiece], theirs[kPiece];
    for (;;)
    {
        const int64 count = readRaw(mine, kPiece);
        const int64 otherCount = other.readRaw(theirs, kPiece);
        if (count != otherCount)
            return false;
        if (count > 0 && memcmp(mine, theirs, static_cast<size_t>(count)) != 0)
            return false;
        if (count < kPiece)
            return true;
    }
}

int32 FStream::read(void* buffer, int count, int* numRead)
{
    const int64 got = readRaw(buffer, count);
    if (got < 1)
        return kStreamFailed;
    if (numRead)
        *numRead = static_cast<int>(got);
    return kResultOk;
}

int32 FStream::write(void* buffer, int count, int* numWritten)
{
    const int64 done = writeRaw(buffer, count);
    if (done < 0 || done < count)
        return kStreamFailed;
    if (numWritten)
        *numWritten = static_cast<int>(done);
    return kResultOk;
}

int32 FStream::seek(int64 pos, int mode, int64* result)
{
    const int64 position = seek(pos, toSeekMode(mode));
    if (result)
        *result = position;
    return position < 0 ? kStreamFailed : kResultOk;
}

int32 FStream::tell(int64* pos)
{
    if (!pos)
        return kStreamInvalidArgument;
    *pos = tell();
    return kResultOk;
}

int32 FStream::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, IBStream::iid))
        return offerInterface<IBStream>(this, object);
    return CmObject::queryInterface(interfaceID, object);
}

bool FStream::readLine(CmBuffer& line, bool trim)
{
    LineScan scan(*this, trim);
    line.setFillSize(0);
    if (!scan.run())
        return false;

    const int64 length = scan.end - scan.first;
    if (length >= INT32_MAX || !line.grow(static_cast<uint32>(length) + 1))
        return false;
    if (length > 0)
    {
        seek(scan.first, kSeekStart);
        line.setFillSize(static_cast<uint32>(std::max<int64>(readRaw(line.ptr(), length), 0)));
    }
    line.ptr()[line.getFillSize()] = 0;
    // -1 goes to the stream as well: a file refuses it and stays at its end, behind blanks that were left out.
    if (scan.next < 0)
        seek(scan.position, kSeekStart);
    seek(scan.next, kSeekStart);
    return true;
}

int64 FStream::writeString16(const char16* text, bool withTerminator)
{
    const char16* const written = text ? text : u"";
    const size_t count = std::char_traits<char16>::length(written) + (withTerminator ? 1 : 0);
    return writeRaw(written, static_cast<int64>(count * sizeof(char16)));
}

FStream* toFStream(FUnknown* unknown)
{
    return FCast(FStream, toFObject(unknown));
}
