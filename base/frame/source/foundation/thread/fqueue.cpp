#include "foundation/thread/fqueue.h"

#include "foundation/thread/flockscope.h"

void FQueue::append(void* item)
{
    FLockScope guard(lock);
    list.append(item);
}

void FQueue::prepend(void* item)
{
    FLockScope guard(lock);
    list.prepend(item);
}

void* FQueue::removeFirst()
{
    FLockScope guard(lock);
    void* item = list.first();
    list.removeFirst();
    return item;
}

void* FQueue::removeLast()
{
    FLockScope guard(lock);
    void* item = list.last();
    list.removeLast();
    return item;
}

bool FQueue::isEmpty()
{
    FLockScope guard(lock);
    return list.isEmpty();
}
