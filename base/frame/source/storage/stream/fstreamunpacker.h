#pragma once

#include "containers/value/cmbuffer.h"
#include "foundation/object/iptr.h"
#include "storage/stream/fmemorystream.h"

/// Gives a compression stream of known size as a stream in memory, where one can seek freely; any other stream as
/// it is.
///
/// The stream that it gives lives as long as the unpacker. One thread at a time.
class FStreamUnpacker
{
public:
    explicit FStreamUnpacker(FStream* stream);
    FStreamUnpacker(const FStreamUnpacker&) = delete;
    FStreamUnpacker& operator=(const FStreamUnpacker&) = delete;

    FStream* getStream() const;

private:
    IPtr<FStream> packed;
    CmBuffer buffer;
    IPtr<FMemoryStream> unpacked;
};
