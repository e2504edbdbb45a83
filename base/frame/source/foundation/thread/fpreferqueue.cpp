#include "foundation/thread/fpreferqueue.h"

#include "foundation/thread/flockscope.h"

bool FPreferQueue::append(void* item, void* id)
{
    FLockScope guard(lock);
    return items.append(item) && ids.append(id);
}

bool FPreferQueue::prepend(void* item, void* id)
{
    FLockScope guard(lock);
    return items.prepend(item) && ids.prepend(id);
}

void* FPreferQueue::removeFirst(void** id)
{
    FLockScope guard(lock);
    void* item = items.first();
    if (id)
        *id = ids.first();
    items.removeFirst();
    ids.removeFirst();
    return item;
}

void* FPreferQueue::removeLast(void** id)
{
    FLockScope guard(lock);
    void* item = items.last();
    if (id)
        *id = ids.last();
    items.removeLast();
    ids.removeLast();
    return item;
}

bool FPreferQueue::prefer(void* id)
{
    FLockScope guard(lock);
    const int place = ids.index(id);
    if (place < 0)
        return false;
    if (place == 0)
        return true;

    void* item = items.at(place);
    items.removeAt(place);
    ids.removeAt(place);
    return prepend(item, id);
}

bool FPreferQueue::idExists(void* id)
{
    FLockScope guard(lock);
    return ids.index(id) >= 0;
}

bool FPreferQueue::isEmpty()
{
    FLockScope guard(lock);
    return items.isEmpty();
}
