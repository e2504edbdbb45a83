#pragma once

#include "containers/sequence/cmnodelist.h"

/// A place in a CmLinkedList.
struct CmLinkedNode
{
    FPOOLED_OBJECTS

    CmLinkedNode* next;
    CmObject* object;
};

template <>
struct CmNodeRules<CmLinkedNode>
{
    static CmLinkedNode* make(CmObject* object) { return new CmLinkedNode{nullptr, object}; }
    static void dispose(CmLinkedNode* node) { delete node; }
    static CmObject* objectOf(CmLinkedNode* node) { return node->object; }
    static void setPrevious(CmLinkedNode*, CmLinkedNode*) {}
    /// Found from the front.
    static CmLinkedNode* before(const CmLinkedNode* node, CmLinkedNode* first);
};

extern template class CmNodeList<CmLinkedNode>;

/// A singly linked list of objects, one node an element. Going backwards is slow; CmDLinkedList exists for that.
/// One thread at a time.
class CmLinkedList : public CmNodeList<CmLinkedNode>
{
    DECLARE_CLASS(CmLinkedList, CmContainer)

    CmLinkedList() = default;
    CmLinkedList(const CmLinkedList& other) : CmNodeList(other) { CmContainer::copy(other); }
    explicit CmLinkedList(const CmContainer& other) { CmContainer::copy(other); }
    CmLinkedList& operator=(const CmLinkedList& other) { return assign(*this, other); }
    CmLinkedList& operator=(const CmContainer& other) { return assign(*this, other); }
};

using CmLinkedListIterator = CmNodeListIterator<CmLinkedNode>;
