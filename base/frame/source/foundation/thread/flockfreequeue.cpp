#include "foundation/thread/flockfreequeue.h"

FLockFreeQueue::FLockFreeQueue(int size, void (*itemDeleter)(void*))
    : TRingBuffer<void*>(size),
      deleter(itemDeleter)
{
}

FLockFreeQueue::~FLockFreeQueue()
{
    flush();
}

void FLockFreeQueue::flush()
{
    while (!isEmpty())
    {
        void* item = pop();
        if (deleter)
            deleter(item);
    }
}
