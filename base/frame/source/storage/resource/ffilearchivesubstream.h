#pragma once

#include "storage/stream/fstreamproxy.h"

class FFileArchive;

/// A file of an archive, read by a handle of its own. It keeps the archive, which counts it. One thread at a time.
class FFileArchiveSubStream : public FStreamProxy
{
    DECLARE_TYPE(FFileArchiveSubStream, FStreamProxy)

    FFileArchiveSubStream(FStream* ownHandle, int64 firstByte, int64 byteCount, FFileArchive* itsArchive);
    FFileArchiveSubStream(const FFileArchiveSubStream&) = delete;
    FFileArchiveSubStream& operator=(const FFileArchiveSubStream&) = delete;
    ~FFileArchiveSubStream() override;
    /// Null: a handle has one stream.
    CmObject* newCopy() const override { return nullptr; }

private:
    /// A pointer with its own counting, since the archive's class isn't known here.
    FFileArchive* archive;
};
