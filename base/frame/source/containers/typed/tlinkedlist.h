#pragma once

#include "containers/typed/tlistbase.h"

/// A place in a TLinkedList.
template <class T>
struct TLinkedNode
{
    explicit TLinkedNode(const T& stored) : value(stored) {}

    void setPrevious(TLinkedNode*) {}
    /// The node that leads to `node`, found from the front.
    static TLinkedNode* before(const TLinkedNode* node, TLinkedNode* head)
    {
        TLinkedNode* found = head == node ? nullptr : head;
        while (found && found->next != node)
            found = found->next;
        return found;
    }

    TLinkedNode* next = nullptr;
    T value;
};

/// A singly linked list of values. Going backwards walks from the front each time; TDLinkedList does not.
template <class T>
class TLinkedList : public TListBase<T, TLinkedNode<T>>
{
public:
    TContainer<T>* newInstance() const override { return new TLinkedList; }
};

template <class T>
using TLinkedListIterator = TListIterator<T, TLinkedNode<T>>;
