#pragma once

#include "foundation/object/iptr.h"
#include "storage/stream/fcompressionengine.h"
#include "storage/stream/fstream.h"

class UProgressHook;

/// Compresses what is written to it, or decompresses what is read from it.
///
/// Either `beginCompress` or `beginDecompress` comes first; reading and writing without isn't allowed. The
/// destructor ends what was begun. One thread at a time.
class FCompressionStream : public FStream
{
    DECLARE_COPYABLE(FCompressionStream, FStream)

    /// A null engine stands for the default one.
    FCompressionStream(FStream* innerStream, FCompressionEngine* itsEngine);
    /// The engine is the component of that class; none where there is no such component.
    FCompressionStream(FStream* innerStream, const FUID& engineClass);
    /// Shares stream and engine; nothing is begun.
    FCompressionStream(const FCompressionStream& other);
    ~FCompressionStream() override;
    FCompressionStream& operator=(const FCompressionStream&) = delete;

    /// The engine that calls itself the default; null where there is none. The caller gets the reference.
    static FCompressionEngine* createDefaultEngine();
    /// The decompressed content of a compression stream as a stream in memory; any other stream is given as it is.
    /// The caller gets the reference; null where memory can't be had.
    static IBStream* createUncompressedStream(IBStream* source);

    /// False without an engine, or where it refuses.
    bool beginCompress(float quality);
    /// `size` is -1 where it isn't known.
    bool beginDecompress(int64 size);
    /// -1 where it isn't known.
    int64 getUncompressedSize() const { return uncompressedSize; }
    FCompressionEngine* getEngine() const { return engine; }

    int64 readRaw(void* target, int64 count) override;
    int64 writeRaw(const void* source, int64 count) override;
    /// Where the engine can't seek, forward means reading, and a target before the position only rewinds: the
    /// stream then stands at its start although the target is given as result.
    int64 seek(int64 target, FSeekMode mode) override;
    int64 tell() override { return position; }
    using FStream::seek;
    using FStream::tell;

    void rewind() override;
    void flush() override;

private:
    void takeFormOfStream();
    void endCompressor();
    void endDecompressor();
    void readAway(int64 count);

    IPtr<FStream> stream;
    IPtr<FCompressionEngine> engine;
    IPtr<FCompressor> compressor;
    IPtr<FDecompressor> decompressor;
    int64 uncompressedSize = -1;
    int64 position = 0;
};

/// Compresses what is left of `source` into `target`. False where it was cancelled or either stream failed; a null
/// engine stands for the default one and the hook may be null.
bool FCompressData(FStream* source, FStream* target, FCompressionEngine* engine, float quality,
                   UProgressHook* hook);

/// The other direction. `bufferSize` below 1 stands for 65536.
bool FDecompressData(FStream* source, FStream* target, FCompressionEngine* engine, UProgressHook* hook,
                     int bufferSize);

/// Estimates compressed over plain size by reading about 8192 bytes on; 1.0 where that can't be told.
float FGetCompressionRatio(FStream* source, FCompressionEngine* engine, float quality);
