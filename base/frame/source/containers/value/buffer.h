#pragma once

#include "foundation/object/types.h"

class String;

/// A block of bytes that grows, and how far it is filled.
///
/// `put` and the text operations write behind the fill size and let the block grow by whole multiples of the
/// growth step. Bytes gained are zero. Operations give false where no memory can be had; sizes are in bytes and
/// below 4 GiB. One thread at a time.
class Buffer
{
public:
    Buffer() = default;
    explicit Buffer(uint32 size);
    Buffer(uint32 size, uint8 fill);
    /// Copies `size` bytes, which count as filled. A null pointer gives an unfilled block of that size.
    Buffer(const void* data, uint32 size);
    Buffer(const Buffer& other);
    virtual ~Buffer();
    Buffer& operator=(const Buffer& other);

    // Size

    uint32 getSize() const { return memSize; }
    uint32 getFillSize() const { return fillSize; }
    uint32 getFree() const { return memSize - fillSize; }
    /// Gives the block exactly this size, keeping what fits. Where not even a copy can be made, the block is
    /// empty afterwards.
    bool setSize(uint32 size);
    /// Makes the block hold at least `size` bytes.
    bool grow(uint32 size) { return size <= memSize || reserve(size); }
    /// Grows where needed.
    bool setFillSize(uint32 size)
    {
        if (!grow(size))
            return false;
        fillSize = size;
        return true;
    }
    bool truncateToFillSize() { return setSize(fillSize); }
    void setDelta(uint32 step) { delta = step; }
    void flush() { fillSize = 0; }

    // Bytes

    char* ptr() const { return buffer; }
    const char* str8() const { return buffer ? buffer : ""; }
    /// The address of a byte, which may lie just behind the block.
    char* operator+(uint32 offset) const { return buffer + offset; }
    bool operator==(const Buffer& other) const;

    bool put(const void* data, uint32 count);
    /// The characters in the string's width, with their terminator.
    bool put(const String& text);
    bool put(char character)
    {
        if (fillSize >= memSize)
            return put(&character, sizeof(character));
        buffer[fillSize++] = character;
        return true;
    }
    bool put(uint8 byte) { return put(&byte, sizeof(byte)); }
    bool put(char16 character) { return put(&character, sizeof(character)); }
    bool put(uint16 value) { return put(&value, sizeof(value)); }
    /// Copies from the fill size on, which moves with it. Gives how many bytes there were.
    uint32 get(void* data, uint32 count);

    /// Fills the whole block.
    void set(uint8 value);
    /// Fills what lies behind the fill size, which stays.
    void fillup(uint8 value);

    // Moving bytes

    /// Copies bytes inside the block, which grows where needed; false where the source reaches past the end.
    bool copy(uint32 from, uint32 to, uint32 count);
    /// Shifts the filled part up by `amount` bytes, or down where it is negative; `fill` takes the vacated places
    /// at the start. Bytes shifted past the start are lost.
    bool move(int amount, uint8 fill = 0);
    /// Opens a gap of `amount` bytes at `position`, or takes out as many from there where it is negative. The
    /// bytes of a gap stay what they were.
    bool shiftAt(uint32 position, int amount);
    /// Takes over the other's block and leaves that one empty.
    void take(Buffer& other);
    /// Hands the block to the caller, who frees it by `free`.
    [[nodiscard]] void* pass();
    /// Reverses the bytes of each element of `width` 2, 4 or 8 in the filled part; false for any other width or
    /// where the last element is cut.
    bool swap(int16 width);

    // Text. The text has a terminator that doesn't count as filled

    bool appendString8(const char* text);
    bool appendString16(const char16* text);
    bool prependString8(const char* text);
    bool prependString16(const char16* text);
    /// Turns the filled part from 8-bit text in that encoding into 16-bit text.
    bool toWideString(int encoding);
    /// Turns the filled part from 16-bit text into 8-bit text in that encoding.
    bool toMultibyteString(int encoding);
    /// Two upper-case digits for each filled byte.
    bool makeHexString(String& result) const;
    /// Reads such digits of either case; false for a null, empty or odd-length text, and at any other character.
    bool fromHexString(const char* text);

protected:
    bool reserve(uint64 size);
    bool insertText(uint32 position, const void* text, size_t count, uint32 width);

    char* buffer = nullptr;
    uint32 memSize = 0;
    uint32 fillSize = 0;
    uint32 delta = 0;
};
