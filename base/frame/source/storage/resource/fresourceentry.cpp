#include "storage/resource/fresourceentry.h"

DEFINE_CLASS(FResourceEntry, FFileArchiveNode)

FResourceEntry::FResourceEntry(const ConstString& name, uint32 itsFlags) : flags(itsFlags)
{
    setName(name);
}

void FResourceEntry::setName(const ConstString& name)
{
    fileName.assign(name);
    // Many threads may read the name, and none must find it narrow and convert it.
    fileName.toWideString();
}

void FResourceEntry::setPlain(int64 size)
{
    flags &= ~uint32{kCompressed};
    dataSize = size;
    uncompressedSize = size;
}

void FResourceEntry::setCompressed(int64 storedSize, int64 plainSize)
{
    flags |= kCompressed;
    dataSize = storedSize;
    uncompressedSize = plainSize;
}
