#pragma once

#include "containers/sequence/cmnodelist.h"

/// A place in a CmDLinkedList.
struct CmDLinkedNode
{
    FPOOLED_OBJECTS

    CmDLinkedNode* next;
    CmObject* object;
    CmDLinkedNode* previous;
};

template <>
struct CmNodeRules<CmDLinkedNode>
{
    static CmDLinkedNode* make(CmObject* object) { return new CmDLinkedNode{nullptr, object, nullptr}; }
    static void dispose(CmDLinkedNode* node) { delete node; }
    static CmObject* objectOf(CmDLinkedNode* node) { return node->object; }
    static void setPrevious(CmDLinkedNode* node, CmDLinkedNode* before) { node->previous = before; }
    static CmDLinkedNode* before(const CmDLinkedNode* node, CmDLinkedNode*) { return node->previous; }
};

extern template class CmNodeList<CmDLinkedNode>;

/// A doubly linked list of objects, one node an element. One thread at a time.
class CmDLinkedList : public CmNodeList<CmDLinkedNode>
{
    DECLARE_CLASS(CmDLinkedList, CmContainer)

    CmDLinkedList() = default;
    CmDLinkedList(const CmDLinkedList& other) : CmNodeList(other) { CmContainer::copy(other); }
    explicit CmDLinkedList(const CmContainer& other) { CmContainer::copy(other); }
    CmDLinkedList& operator=(const CmDLinkedList& other) { return assign(*this, other); }
    CmDLinkedList& operator=(const CmContainer& other) { return assign(*this, other); }
};

using CmDLinkedListIterator = CmNodeListIterator<CmDLinkedNode>;
