#include "containers/value/cmbufferpool.h"

#include "foundation/object/iptr.h"
#include "foundation/thread/flockscope.h"

CmBufferPool::CmBufferPool(const CmBufferPool& other) : CmArray(other.size(), 10) {}

CmBufferPool::~CmBufferPool()
{
    reduceBuffers(0);
}

CmBuffer* CmBufferPool::takeBuffer(uint32 size)
{
    FLockScope guard(lock);
    for (int i = 0; i < total(); i++)
    {
        auto* buffer = static_cast<CmBuffer*>(at(i));
        if (buffer->getSize() < size)
            continue;
        removeAt(i);
        return buffer;
    }
    return nullptr;
}

CmBuffer* CmBufferPool::allocateBuffer(uint32 size)
{
    if (size == 0)
        return new CmBuffer;
    CmBuffer* buffer = takeBuffer(size);
    if (!buffer)
        return new CmBuffer(size);
    buffer->setFillSize(0);
    return buffer;
}

void CmBufferPool::freeBuffer(Buffer& buffer)
{
    if (buffer.getSize() == 0)
        return;
    auto* kept = new CmBuffer;
    kept->take(buffer);
    deleteBuffer(kept);
}

bool CmBufferPool::configBuffer(Buffer& buffer, uint32 size)
{
    if (buffer.getSize() > 0)
        return buffer.setSize(size);
    const auto pooled = adopt(takeBuffer(size));
    if (!pooled)
        return buffer.setSize(size);
    buffer.take(*pooled);
    return buffer.setFillSize(0);
}

void CmBufferPool::deleteBuffer(CmBuffer* buffer)
{
    if (!buffer)
        return;
    FLockScope guard(lock);
    if (!add(buffer))
        buffer->release();
}

void CmBufferPool::reduceBuffers(int keep)
{
    FLockScope guard(lock);
    takeElements();
    for (int i = total() - 1; i >= 0 && i >= keep; i--)
        removeAt(i);
    shareElements();
}
