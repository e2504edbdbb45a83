#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/object/fuid.h"

class FStream;

/// Compresses into a stream. One thread at a time.
class FCompressor : public FObject
{
    DECLARE_TYPE(FCompressor, FObject)

    /// `quality` goes from 0, the fastest, to 1, the smallest. The stream is borrowed until `end`.
    virtual bool begin(FStream* target, float quality) = 0;
    virtual bool write(void* data, int count) = 0;
    virtual void end() = 0;
    virtual void flush() = 0;
};

/// Decompresses from a stream. One thread at a time.
class FDecompressor : public FObject
{
    DECLARE_TYPE(FDecompressor, FObject)

    /// The stream is borrowed until `end`.
    virtual bool begin(FStream* source) = 0;
    /// Gives how many bytes came; 0 or less at the end and where the data is damaged.
    virtual int read(void* data, int count) = 0;
    virtual void end() = 0;
    virtual bool canSeek() = 0;
    /// `mode` is an FSeekMode. Gives the new position.
    virtual int64 seek(int64 position, int mode) = 0;
};

/// A way of compressing. Engines are components of the category "Compression Engine".
///
/// The data format is the engine's own, told apart by an identifier. *Thread-safe*: an archive that several threads
/// read makes its decompressors from one engine. What it makes belongs to one thread at a time.
class FCompressionEngine : public CmObject
{
    DECLARE_ABSTRACT_CLASS(FCompressionEngine, CmObject)

    /// What `getType` gives for the engine that is used where none is named.
    static constexpr int kDefaultEngine = 1;

    /// The caller gets the reference.
    virtual FCompressor* newCompressor() = 0;
    virtual FDecompressor* newDecompressor() = 0;
    virtual void getFormat(FUID& format) = 0;
    virtual int getType() = 0;
    /// How many bytes so many compressed ones can hold at most; a file that claims more is damaged. Without a limit
    /// of the format, the largest number.
    virtual int64 getMaxUncompressedSize(int64 compressedSize);

    bool isFormat(const FUID& format);
};
