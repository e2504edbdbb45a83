#include "storage/resource/ffilearchivesubstream.h"

#include "storage/resource/ffilearchive.h"

FFileArchiveSubStream::FFileArchiveSubStream(FStream* ownHandle, int64 firstByte, int64 byteCount,
                                             FFileArchive* itsArchive)
    : FStreamProxy(ownHandle, firstByte, byteCount, kFileRead),
      archive(itsArchive)
{
    archive->addRef();
    archive->openSubStreams++;
}

FFileArchiveSubStream::~FFileArchiveSubStream()
{
    // The handle goes before the archive is told that it is gone.
    stream = nullptr;
    archive->openSubStreams--;
    archive->release();
}
