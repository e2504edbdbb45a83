#pragma once

#include "containers/sequence/cmlinkedlist.h"

/// Last in, first out; iteration begins at the top. One thread at a time.
class CmStack : public CmLinkedList
{
    DECLARE_CLASS(CmStack, CmLinkedList)

    using CmLinkedList::operator=;
    bool push(CmObject* object) { return prepend(object); }
    /// Hand the element with its reference to the caller; null in an empty stack.
    CmObject* pop() { return removeFirst(); }
    CmObject* removeBottom() { return removeLast(); }
    CmObject* peek() const { return first(); }
};
