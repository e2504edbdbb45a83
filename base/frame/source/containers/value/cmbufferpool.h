#pragma once

#include "containers/sequence/cmarray.h"
#include "containers/value/cmbuffer.h"
#include "foundation/thread/flock.h"

/// Keeps buffers that are out of use for the next who needs one.
///
/// The pool holds the one reference of each kept buffer. The operations below are thread-safe; those of the array
/// are not.
class CmBufferPool : public CmArray
{
    DECLARE_COPYABLE(CmBufferPool, CmArray)

    CmBufferPool() = default;
    /// A new, empty pool: buffers in reserve aren't shared.
    CmBufferPool(const CmBufferPool& other);
    ~CmBufferPool() override;
    CmBufferPool& operator=(const CmBufferPool&) = delete;

    /// A buffer of at least `size` bytes with nothing filled; 0 gives a new empty one. The caller gets the
    /// reference.
    CmBuffer* allocateBuffer(uint32 size);
    /// Takes the storage of `buffer`, which is empty afterwards.
    void freeBuffer(Buffer& buffer);
    /// Gives `buffer` a storage of `size` bytes, or of more from the pool.
    bool configBuffer(Buffer& buffer, uint32 size);
    /// Takes over the caller's reference; null does nothing.
    void deleteBuffer(CmBuffer* buffer);
    /// Frees all buffers but `keep`, last ones first.
    void reduceBuffers(int keep);

private:
    /// Takes the first buffer of at least `size` bytes out of the pool; null where there is none.
    CmBuffer* takeBuffer(uint32 size);

    FLock lock{"buffer pool"};
};
