#pragma once

#include "foundation/object/types.h"
#include "storage/stream/fseekmode.h"

/// Typed reading and writing on top of four raw operations.
///
/// Values are little-endian; a byte order other than 0 reverses the bytes of each value of more than one. Typed
/// operations give true when the whole value moved; a failed read stores zero in its target. One thread at a time.
class FStreamer
{
public:
    explicit FStreamer(int16 order) : byteOrder(order) {}

    /// The number of bytes moved, fewer than asked at the end; 0 or -1 where none could be.
    virtual int64 readRaw(void* data, int64 count) = 0;
    virtual int64 writeRaw(const void* data, int64 count) = 0;
    /// The new position; -1 on failure.
    virtual int64 seek(int64 position, FSeekMode mode) = 0;
    virtual int64 tell() = 0;

    int16 getByteOrder() const { return byteOrder; }
    void setByteOrder(int16 order) { byteOrder = order; }

    // Numbers

    bool writeChar8(char value) { return writeValue(value); }
    bool readChar8(char& value) { return readValue(value); }
    bool writeUChar8(uint8 value) { return writeValue(value); }
    bool readUChar8(uint8& value) { return readValue(value); }
    bool writeChar16(char16 value) { return writeValue(value); }
    bool readChar16(char16& value) { return readValue(value); }
    bool writeInt16(int16 value) { return writeValue(value); }
    bool readInt16(int16& value) { return readValue(value); }
    bool writeInt16u(uint16 value) { return writeValue(value); }
    bool readInt16u(uint16& value) { return readValue(value); }
    bool writeInt32(int32 value) { return writeValue(value); }
    bool readInt32(int32& value) { return readValue(value); }
    bool writeInt32u(uint32 value) { return writeValue(value); }
    bool readInt32u(uint32& value) { return readValue(value); }
    bool writeInt64(int64 value) { return writeValue(value); }
    bool readInt64(int64& value) { return readValue(value); }
    bool writeInt64u(uint64 value) { return writeValue(value); }
    bool readInt64u(uint64& value) { return readValue(value); }
    bool writeFloat(float value) { return writeValue(value); }
    bool readFloat(float& value) { return readValue(value); }
    bool writeDouble(double value) { return writeValue(value); }
    bool readDouble(double& value) { return readValue(value); }
    /// Takes two bytes; any number but 0 reads as true.
    bool writeBool(bool value) { return writeInt16(value ? 1 : 0); }
    bool readBool(bool& value);

    // Rows of numbers. The first failure stops; on reading it zeroes that one element

    bool writeInt16Array(const int16* values, int count) { return writeArray(values, count); }
    bool readInt16Array(int16* values, int count) { return readArray(values, count); }
    bool writeInt16uArray(const uint16* values, int count) { return writeArray(values, count); }
    bool readInt16uArray(uint16* values, int count) { return readArray(values, count); }
    bool writeInt32Array(const int32* values, int count) { return writeArray(values, count); }
    bool readInt32Array(int32* values, int count) { return readArray(values, count); }
    bool writeInt32uArray(const uint32* values, int count) { return writeArray(values, count); }
    bool readInt32uArray(uint32* values, int count) { return readArray(values, count); }
    bool writeInt64Array(const int64* values, int count) { return writeArray(values, count); }
    bool readInt64Array(int64* values, int count) { return readArray(values, count); }
    bool writeInt64uArray(const uint64* values, int count) { return writeArray(values, count); }
    bool readInt64uArray(uint64* values, int count) { return readArray(values, count); }
    bool writeFloatArray(const float* values, int count) { return writeArray(values, count); }
    bool readFloatArray(float* values, int count) { return readArray(values, count); }
    bool writeDoubleArray(const double* values, int count) { return writeArray(values, count); }
    bool readDoubleArray(double* values, int count) { return readArray(values, count); }

    // Bytes

    /// Reads bytes and forgets them; false at the first that isn't there.
    bool skip(uint32 count);
    /// Writes zero bytes.
    bool pad(uint32 count);

    // Text of 8 bits

    /// A 32-bit count that includes the terminator, then as many bytes; null is a count of 0.
    bool writeStr8(const char* text);
    /// A terminated block of the stored count, to be freed by `delete[]`; null where the count is 0 or less or can't
    /// be read, or no memory can be had. Where the stream ends early, so does the block.
    [[nodiscard]] char* readStr8();
    /// How many bytes `writeStr8` takes; 4 for null.
    static int64 getStr8Size(const char* text);
    /// The characters without a count.
    bool writeString8(const char* text, bool withTerminator);
    /// Reads up to a NUL, a line feed, `size` bytes or the end, and terminates; a carriage return before the line
    /// feed goes with it. Gives the length of the text; one that fills the buffer loses its last byte.
    int64 readString8(char* buffer, int64 size);

    // Text of 16 bits, stored as UTF-8 or, where it is plain ASCII, without the mark EF BB BF in front

    bool writeStringUtf8(const char16* text);
    /// Reads up to a NUL or the end of the stream; without the mark the text is in the system's encoding. Gives
    /// the length; at most `maxChars` - 1 characters are kept.
    int readStringUtf8(char16* buffer, int maxChars);

protected:
    FStreamer(const FStreamer&) = default;
    FStreamer& operator=(const FStreamer&) = default;
    ~FStreamer() = default;

    int16 byteOrder;

private:
    char* readLongStr8(int32 count);

    template <class T>
    static void reverse(T& value);
    template <class T>
    bool writeValue(T value);
    template <class T>
    bool readValue(T& value);
    template <class T>
    bool writeArray(const T* values, int count);
    template <class T>
    bool readArray(T* values, int count);
};

template <class T>
void FStreamer::reverse(T& value)
{
    auto* bytes = reinterpret_cast<char*>(&value);
    for (unsigned i = 0; i < sizeof(T) / 2; i++)
    {
        const char byte = bytes[i];
        bytes[i] = bytes[sizeof(T) - 1 - i];
        bytes[sizeof(T) - 1 - i] = byte;
    }
}

template <class T>
bool FStreamer::writeValue(T value)
{
    if (byteOrder != 0)
        reverse(value);
    return writeRaw(&value, sizeof(T)) == sizeof(T);
}

template <class T>
bool FStreamer::readValue(T& value)
{
    if (readRaw(&value, sizeof(T)) != sizeof(T))
    {
        value = T{};
        return false;
    }
    if (byteOrder != 0)
        reverse(value);
    return true;
}

template <class T>
bool FStreamer::writeArray(const T* values, int count)
{
    for (int i = 0; i < count; i++)
        if (!writeValue(values[i]))
            return false;
    return true;
}

template <class T>
bool FStreamer::readArray(T* values, int count)
{
    for (int i = 0; i < count; i++)
        if (!readValue(values[i]))
            return false;
    return true;
}
