#pragma once

#include "containers/typed/tlistbase.h"

/// A place in a TDLinkedList.
template <class T>
struct TDLinkedNode
{
    explicit TDLinkedNode(const T& stored) : value(stored) {}

    void setPrevious(TDLinkedNode* node) { previous = node; }
    static TDLinkedNode* before(const TDLinkedNode* node, TDLinkedNode*) { return node->previous; }

    TDLinkedNode* next = nullptr;
    T value;
    TDLinkedNode* previous = nullptr;
};

/// A doubly linked list of values.
template <class T>
class TDLinkedList : public TListBase<T, TDLinkedNode<T>>
{
public:
    TContainer<T>* newInstance() const override { return new TDLinkedList; }
};

template <class T>
using TDLinkedListIterator = TListIterator<T, TDLinkedNode<T>>;
