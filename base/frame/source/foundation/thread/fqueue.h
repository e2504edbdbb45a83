#pragma once

#include "containers/typed/tdlinkedlist.h"
#include "foundation/thread/flock.h"

/// A queue of plain pointers with two ends. Owns nothing. Thread-safe.
class FQueue
{
public:
    void append(void* item);
    void prepend(void* item);
    /// Null from an empty queue.
    void* removeFirst();
    void* removeLast();
    bool isEmpty();

    /// For owners that keep more than the list under this lock.
    FLock& guard() { return lock; }

private:
    TDLinkedList<void*> list;
    FLock lock{"queue"};
};
