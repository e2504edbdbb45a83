#pragma once

#include "containers/sequence/cmlinkedlist.h"

/// First in, first out. One thread at a time.
class CmQueue : public CmLinkedList
{
    DECLARE_CLASS(CmQueue, CmLinkedList)

    using CmLinkedList::operator=;
    bool enqueue(CmObject* object) { return append(object); }
    /// Hands the element with its reference to the caller; null in an empty queue.
    CmObject* dequeue() { return removeFirst(); }
    CmObject* peek() const { return first(); }
};
