#pragma once

#include "storage/stream/fcompressionengine.h"

/// The default engine: deflate with a check sum at the end, in the form that zlib calls its own.
///
/// A quality from 0 to 1 is a level from 1 to 9. *Thread-safe*.
class FZlibEngine : public FCompressionEngine
{
    DECLARE_COPYABLE(FZlibEngine, FCompressionEngine)

    FCompressor* newCompressor() override;
    FDecompressor* newDecompressor() override;
    void getFormat(FUID& format) override;
    int getType() override { return kDefaultEngine; }
    int64 getMaxUncompressedSize(int64 compressedSize) override;

    /// The class and the format in one.
    static const FUIDBytes kClassID;
};
