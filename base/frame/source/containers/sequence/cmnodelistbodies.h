#pragma once

#include "containers/sequence/cmnodelist.h"

#include <memory>

// The bodies of CmNodeList, for the sources that instantiate it.

/// The node that leads to `node`, found from the front; null for the first one.
template <class Node>
Node* findBefore(const Node* node, Node* first)
{
    Node* found = first == node ? nullptr : first;
    while (found && found->next != node)
        found = found->next;
    return found;
}

template <class Node>
bool CmNodeList<Node>::remove(CmObject* object)
{
    CmObject* removed = takeEqual(object);
    testDelete(removed);
    return removed != nullptr;
}

template <class Node>
CmObject* CmNodeList<Node>::takeEqual(const CmObject* object)
{
    Node* predecessor = nullptr;
    for (Node* node = _first; object && node; predecessor = node, node = node->next)
        if (objectOf(node)->isEqual(object))
            return unlink(predecessor, node);
    return nullptr;
}

template <class Node>
Node* CmNodeList<Node>::nodeEqualTo(const CmObject* object) const
{
    Node* node = object ? _first : nullptr;
    while (node && !objectOf(node)->isEqual(object))
        node = node->next;
    return node;
}

template <class Node>
int CmNodeList<Node>::occurrences(const CmObject* object) const
{
    int count = 0;
    for (Node* node = nodeEqualTo(object); node; node = node->next)
        if (objectOf(node)->isEqual(object))
            count++;
    return count;
}

template <class Node>
int CmNodeList<Node>::getIndex(const CmObject* object) const
{
    int index = 0;
    for (Node* node = _first; object && node; node = node->next, index++)
        if (objectOf(node)->isEqual(object))
            return index;
    return -1;
}

template <class Node>
bool CmNodeList<Node>::remove(const CmIterator& position)
{
    Node* node = nodeUnder(position);
    if (!node)
        return false;
    static_cast<const CmNodeListIterator<Node>&>(position).node = node->next;
    testDelete(unlink(before(node), node));
    return true;
}

template <class Node>
bool CmNodeList<Node>::removeAt(int index)
{
    Node* node = nodeAt(index);
    if (!node)
        return false;
    testDelete(unlink(before(node), node));
    return true;
}

template <class Node>
void CmNodeList<Node>::removeAll()
{
    while (_first)
        testDelete(unlink(nullptr, _first));
}

template <class Node>
CmIterator* CmNodeList<Node>::newIterator() const
{
    return new CmNodeListIterator<Node>(*this);
}

template <class Node>
bool CmNodeList<Node>::insertBefore(const CmObject* place, CmObject* object)
{
    Node* node = nodeOf(place);
    return node && link(object, before(node));
}

template <class Node>
bool CmNodeList<Node>::insertBefore(const CmIterator& place, CmObject* object)
{
    Node* node = nodeUnder(place);
    return node && link(object, before(node));
}

template <class Node>
bool CmNodeList<Node>::insertAfter(const CmObject* place, CmObject* object)
{
    Node* node = nodeOf(place);
    return node && link(object, node);
}

template <class Node>
bool CmNodeList<Node>::insertAfter(const CmIterator& place, CmObject* object)
{
    Node* node = nodeUnder(place);
    return node && link(object, node);
}

template <class Node>
bool CmNodeList<Node>::insertAt(int index, CmObject* object)
{
    if (index < 0 || index > _size)
        return false;
    return link(object, index == 0 ? nullptr : nodeAt(index - 1));
}

template <class Node>
bool CmNodeList<Node>::replaceAt(int index, CmObject* object)
{
    Node* node = nodeAt(index);
    if (!node || !object)
        return false;
    // An object that takes its own place must not be released for it.
    if (objectOf(node) == object)
        return true;
    if (!link(object, node))
        return false;
    testDelete(unlink(before(node), node));
    return true;
}

template <class Node>
bool CmNodeList<Node>::addSorted(CmObject* object)
{
    if (!object)
        return false;
    Node* predecessor = nullptr;
    for (Node* node = _first; node && objectOf(node)->compare(object) <= 0; node = node->next)
        predecessor = node;
    return link(object, predecessor);
}

template <class Node>
CmObject* CmNodeList<Node>::removeFirst()
{
    return _first ? unlink(nullptr, _first) : nullptr;
}

template <class Node>
CmObject* CmNodeList<Node>::removeLast()
{
    return _last ? unlink(before(_last), _last) : nullptr;
}

template <class Node>
bool CmNodeList<Node>::removeAbs(CmObject* object)
{
    Node* predecessor = nullptr;
    for (Node* node = _first; node; predecessor = node, node = node->next)
        if (objectOf(node) == object)
        {
            testDelete(unlink(predecessor, node));
            return true;
        }
    return false;
}

template <class Node>
bool CmNodeList<Node>::addAllFromAbs(const CmContainer& other)
{
    bool isComplete = true;
    int remaining = other.total();
    for (std::unique_ptr<CmIterator> it(other.newIterator()); remaining > 0 && !it->done(); remaining--)
        isComplete = add(it->next()) && isComplete;
    return isComplete;
}

template <class Node>
bool CmNodeList<Node>::link(CmObject* object, Node* predecessor)
{
    Node* node = object ? CmNodeRules<Node>::make(object) : nullptr;
    // A link that is here already need not show it: an end has no neighbour.
    if (!node || node == _first || node == _last)
        return false;
    node->next = predecessor ? predecessor->next : _first;
    CmNodeRules<Node>::setPrevious(node, predecessor);
    (predecessor ? predecessor->next : _first) = node;
    if (node->next)
        CmNodeRules<Node>::setPrevious(node->next, node);
    else
        _last = node;
    _size++;
    testRemember(object);
    return true;
}

template <class Node>
CmObject* CmNodeList<Node>::unlink(Node* predecessor, Node* node)
{
    (predecessor ? predecessor->next : _first) = node->next;
    if (node->next)
        CmNodeRules<Node>::setPrevious(node->next, predecessor);
    else
        _last = predecessor;
    _size--;
    CmObject* object = objectOf(node);
    CmNodeRules<Node>::dispose(node);
    return object;
}

template <class Node>
Node* CmNodeList<Node>::nodeOf(const CmObject* object) const
{
    Node* node = _first;
    while (node && objectOf(node) != object)
        node = node->next;
    return node;
}

template <class Node>
Node* CmNodeList<Node>::nodeAt(int index) const
{
    if (index < 0 || index >= _size)
        return nullptr;
    if (index == _size - 1)
        return _last;
    Node* node = _first;
    while (index-- > 0)
        node = node->next;
    return node;
}

template <class Node>
Node* CmNodeList<Node>::nodeUnder(const CmIterator& position) const
{
    return position.walksOver(this) ? static_cast<const CmNodeListIterator<Node>&>(position).node : nullptr;
}
