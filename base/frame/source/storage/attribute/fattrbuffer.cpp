#include "storage/attribute/fattrbuffer.h"

#include "storage/attribute/boundedread.h"
#include "storage/attribute/farchive.h"
#include "storage/stream/fmemorystream.h"

#include <cstdlib>
#include <cstring>
#include <limits>

DEFINE_CLASS(FAttrBuffer, CmObject)

FAttrBuffer::FAttrBuffer(const void* block, uint32 blockSize, bool copy)
{
    if (!block)
        return;
    if (copy)
        copyBlock(block, blockSize);
    else
    {
        data = block;
        size = blockSize;
    }
}

FAttrBuffer::FAttrBuffer(const FAttrBuffer& other) : CmObject(other)
{
    copyBlock(other.data, other.size);
}

FAttrBuffer::~FAttrBuffer()
{
    empty();
}

void FAttrBuffer::copyBlock(const void* block, uint32 blockSize)
{
    void* copied = blockSize ? malloc(blockSize) : nullptr;
    if (!copied)
        return;
    memcpy(copied, block, blockSize);
    data = copied;
    size = blockSize;
    isOwner = true;
}

void FAttrBuffer::empty()
{
    if (isOwner)
        free(const_cast<void*>(data));
    data = nullptr;
    size = 0;
    isOwner = false;
}

bool FAttrBuffer::externalize(FArchive& archive) const
{
    if (size > static_cast<uint32>(std::numeric_limits<int32>::max()))
        return false;
    return archive.writeCount(static_cast<int>(size)) &&
           archive.getStream().writeRaw(data, size) == int64{size};
}

bool FAttrBuffer::internalize(FArchive& archive)
{
    empty();
    int count = 0;
    FMemoryStream bytes;
    if (!archive.readCount(count) || !readBounded(archive.getStream(), count, bytes))
        return false;
    size = static_cast<uint32>(count);
    data = bytes.pass();
    isOwner = true;
    return true;
}
