#pragma once

#include "storage/stream/fstream.h"
#include "storage/stream/imemorystream.h"
#include "storage/stream/isizeablestream.h"

/// A stream in memory, which grows by pages of 4096 bytes.
///
/// A stream made on a block of the caller's is read and overwritten in place and can't grow. Once memory ran out
/// the stream takes no more writes, and `verify` tells. One thread at a time.
class FMemoryStream : public FStream, public ISizeableStream, public IMemoryStream
{
    DECLARE_CLASS(FMemoryStream, FStream)
    FORWARD_FUNKNOWN(FStream)

    FMemoryStream() = default;
    /// The block must outlive the stream.
    FMemoryStream(void* memory, int length) : FMemoryStream(memory, int64{length}) {}
    FMemoryStream(void* memory, int64 length);
    /// Copies the bytes; the copy stands behind them.
    FMemoryStream(const FMemoryStream& other);
    ~FMemoryStream() override;
    FMemoryStream& operator=(const FMemoryStream& other);

    // The block

    char* getData() const override { return data; }
    int64 getSize() const override { return size; }
    int64 getAllocated() const { return allocated; }
    bool ownsData() const { return ownsMemory; }
    /// Bytes gained are not set. 0 or less frees the block. False, and nothing left, where memory ran out.
    bool setSize(int64 newSize);
    /// Hands the block to the caller, who frees it by `free`; `getSize` tells its size still.
    [[nodiscard]] void* pass();
    /// Empties the stream but keeps the block.
    void reset();
    /// Takes over the other's content and leaves that one empty.
    void takeOver(FMemoryStream& other);
    /// Gives back what lies behind the content; false where the block is the caller's.
    bool truncate();
    bool truncateToCursor();

    int64 readRaw(void* target, int64 count) override;
    int64 writeRaw(const void* source, int64 count) override;
    /// The position may lie past the end or before the start; only kSeekEnd stays inside the end.
    int64 seek(int64 position, FSeekMode mode) override;
    int64 tell() override { return cursor; }
    using FStream::read;
    using FStream::seek;
    using FStream::tell;

    void rewind() override { cursor = 0; }
    bool verify() override { return !allocationError; }
    /// False also where the other stream is one in memory and has fewer bytes.
    bool read(FStream& from, uint32 count) override;
    bool copyTo(FStream& to) override;
    int32 getStreamSize(int64& result) override;
    int32 setStreamSize(int64 newSize) override;

    int32 queryInterface(const char* interfaceID, void** object) override;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;
    /// Takes the bytes under any key; false where there are none.
    bool fromAttributes(const char* key, FAttributes& attributes);

private:
    /// The size, 0 where the block was passed on.
    int64 storedSize() const { return data ? size : 0; }
    bool reallocate(int64 newAllocation);
    bool readGrowing(FStream& from, int64 count);
    bool includeEnd(int64 end);
    void dropBlock();
    void copyBytes(const FMemoryStream& other);

    char* data = nullptr;
    int64 allocated = 0;
    int64 size = 0;
    bool ownsMemory = true;
    bool allocationError = false;
    int64 cursor = 0;
};
