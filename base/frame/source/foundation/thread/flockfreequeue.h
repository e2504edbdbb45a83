#pragma once

#include "foundation/thread/tringbuffer.h"

/// A ring of pointers for threads that must not block.
///
/// What is still in it at the end goes to `deleter`. Thread-safe for one thread that pushes and one that pops.
class FLockFreeQueue : public TRingBuffer<void*>
{
public:
    /// `deleter` may be null: then the pointers are dropped.
    FLockFreeQueue(int size, void (*itemDeleter)(void*));
    ~FLockFreeQueue();

    /// Empties the queue into `deleter`. For the consumer.
    void flush();

private:
    void (*deleter)(void*);
};
