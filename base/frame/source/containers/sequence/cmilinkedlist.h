#pragma once

#include "containers/sequence/cmilink.h"
#include "containers/sequence/cmnodelist.h"

template <>
struct CmNodeRules<CmILink>
{
    /// Null for what is no CmILink or stands in a list already; of a list's only element this can't be seen.
    static CmILink* make(CmObject* object);
    static void dispose(CmILink* link) { link->next = nullptr; }
    static CmObject* objectOf(CmILink* link) { return link; }
    static void setPrevious(CmILink*, CmILink*) {}
    /// Found from the front.
    static CmILink* before(const CmILink* link, CmILink* first);
};

extern template class CmNodeList<CmILink>;

/// A list without nodes: its elements are CmILinks, which carry their links; anything else is refused.
///
/// An element can stand in only one such list at a time. So a copy of the list holds copies in mode 1 and is empty
/// in the other modes. One thread at a time.
class CmILinkedList : public CmNodeList<CmILink>
{
    DECLARE_CLASS(CmILinkedList, CmContainer)

    CmILinkedList() = default;
    CmILinkedList(const CmILinkedList& other) : CmNodeList(other) { CmILinkedList::copy(other); }
    explicit CmILinkedList(const CmContainer& other) { CmILinkedList::copy(other); }
    CmILinkedList& operator=(const CmILinkedList& other)
    {
        return *this = static_cast<const CmContainer&>(other);
    }
    CmILinkedList& operator=(const CmContainer& other);

    void copy(const CmContainer& source) override;

    /// Take all elements of the other list with their references, in constant time; the modes stay.
    void appendList(CmILinkedList& other) { appendNodes(other); }
    void prependList(CmILinkedList& other) { prependNodes(other); }
    /// Removes what is here and takes the elements and the mode of the other list, which is then empty.
    void takeOver(CmILinkedList& other);
    /// Exchanges the elements and the modes.
    void swap(CmILinkedList& other) { swapNodes(other); }
};

using CmILinkedListIterator = CmNodeListIterator<CmILink>;
