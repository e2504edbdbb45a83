#pragma once

#include "containers/typed/tdlinkedlist.h"
#include "foundation/thread/flock.h"

/// A queue whose entries carry an id, by which one can be moved to the front. Owns nothing. Thread-safe.
class FPreferQueue
{
public:
    bool append(void* item, void* id);
    bool prepend(void* item, void* id);
    /// Null from an empty queue; `id`, which may be null, gets the id of the entry.
    void* removeFirst(void** id);
    void* removeLast(void** id);
    /// Moves the first entry with this id to the front; false where there is none.
    bool prefer(void* id);
    bool idExists(void* id);
    bool isEmpty();

private:
    // Two lists of one length; entries at the same place belong together.
    TDLinkedList<void*> items;
    TDLinkedList<void*> ids;
    FLock lock{"prefer queue"};
};
