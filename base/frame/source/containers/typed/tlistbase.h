#pragma once

#include "containers/typed/tcontainer.h"

template <class T, class Node>
class TListIterator;

/// What the two typed lists share. `Node` has `next` and `value`, and says what it knows of its predecessor.
/// One thread at a time.
template <class T, class Node>
class TListBase : public TContainer<T>
{
public:
    using Iterator = TListIterator<T, Node>;

    TListBase() = default;
    TListBase(const TListBase& other) : TContainer<T>(other) { appendAll(other); }
    TListBase& operator=(const TListBase& other);
    ~TListBase() override { TListBase::removeAll(); }

    int total() const override { return count; }
    bool add(const T& value) override { return append(value); }
    bool remove(const T& value) override;
    bool removeAt(int index) override;
    void removeAll() override;
    TIterator<T>* newIterator() const override { return new Iterator(*this); }

    bool append(const T& value) { return link(value, tail); }
    bool prepend(const T& value) { return link(value, nullptr); }
    /// The element will have the place `index`; false beyond the end.
    bool insertAt(int index, const T& value);
    /// The end elements; the empty value in an empty list.
    const T& first() const { return head ? head->value : TContainer<T>::none(); }
    const T& last() const { return tail ? tail->value : TContainer<T>::none(); }
    bool removeFirst() { return head && unlink(nullptr, head); }
    bool removeLast() { return tail && unlink(before(tail), tail); }
    /// The first element equal to `value`; -1 where there is none.
    int index(const T& value) const;
    /// Removes the element under the cursor, which moves on to the next one.
    bool remove(Iterator& position);

private:
    friend class TListIterator<T, Node>;

    bool link(const T& value, Node* predecessor);
    bool unlink(Node* predecessor, Node* node);
    Node* before(const Node* node) const { return Node::before(node, head); }
    Node* nodeAt(int index) const;
    void appendAll(const TListBase& other);

    Node* head = nullptr;
    Node* tail = nullptr;
    int count = 0;
};

/// Walks over a typed list.
template <class T, class Node>
class TListIterator : public TIterator<T>
{
public:
    explicit TListIterator(const TListBase<T, Node>& walked) : list(&walked), node(walked.head) {}

    bool done() const override { return !node; }
    const T& next() override { return move(node ? node->next : nullptr); }
    const T& previous() override { return move(node ? list->before(node) : nullptr); }
    const T& current() const override { return valueOf(node); }
    const T& first() override { return valueOf(node = list->head); }
    const T& last() override { return valueOf(node = list->tail); }

private:
    friend class TListBase<T, Node>;

    static const T& valueOf(const Node* place) { return place ? place->value : TContainer<T>::none(); }
    const T& move(Node* target)
    {
        const Node* left = node;
        node = target;
        return valueOf(left);
    }

    const TListBase<T, Node>* list;
    Node* node;
};

template <class T, class Node>
TListBase<T, Node>& TListBase<T, Node>::operator=(const TListBase& other)
{
    if (this == &other)
        return *this;
    removeAll();
    appendAll(other);
    return *this;
}

template <class T, class Node>
bool TListBase<T, Node>::remove(const T& value)
{
    Node* predecessor = nullptr;
    for (Node* node = head; node; predecessor = node, node = node->next)
        if (node->value == value)
            return unlink(predecessor, node);
    return false;
}

template <class T, class Node>
bool TListBase<T, Node>::removeAt(int index)
{
    Node* node = nodeAt(index);
    return node && unlink(before(node), node);
}

template <class T, class Node>
void TListBase<T, Node>::removeAll()
{
    while (removeFirst())
        ;
}

template <class T, class Node>
bool TListBase<T, Node>::insertAt(int index, const T& value)
{
    if (index < 0 || index > count)
        return false;
    return link(value, index == 0 ? nullptr : nodeAt(index - 1));
}

template <class T, class Node>
int TListBase<T, Node>::index(const T& value) const
{
    int position = 0;
    for (const Node* node = head; node; node = node->next, position++)
        if (node->value == value)
            return position;
    return -1;
}

template <class T, class Node>
bool TListBase<T, Node>::remove(Iterator& position)
{
    Node* node = position.node;
    if (!node)
        return false;
    position.node = node->next;
    return unlink(before(node), node);
}

template <class T, class Node>
bool TListBase<T, Node>::link(const T& value, Node* predecessor)
{
    Node* node = new Node(value);
    node->next = predecessor ? predecessor->next : head;
    node->setPrevious(predecessor);
    (predecessor ? predecessor->next : head) = node;
    if (node->next)
        node->next->setPrevious(node);
    else
        tail = node;
    count++;
    return true;
}

template <class T, class Node>
bool TListBase<T, Node>::unlink(Node* predecessor, Node* node)
{
    (predecessor ? predecessor->next : head) = node->next;
    if (node->next)
        node->next->setPrevious(predecessor);
    else
        tail = predecessor;
    count--;
    delete node;
    return true;
}

template <class T, class Node>
Node* TListBase<T, Node>::nodeAt(int index) const
{
    if (index < 0 || index >= count)
        return nullptr;
    if (index == count - 1)
        return tail;
    Node* node = head;
    while (index-- > 0)
        node = node->next;
    return node;
}

template <class T, class Node>
void TListBase<T, Node>::appendAll(const TListBase& other)
{
    for (const Node* node = other.head; node; node = node->next)
        append(node->value);
}
