#pragma once

#include "containers/sequence/cmilink.h"
#include "containers/sequence/cmlinklistof.h"

template <>
struct CmNodeRules<CmILink>
{
    static constexpr const char* kListName = "CmILinkedList";
    /// Null for what is no CmILink or stands in a list already; of the last element of a list this can't be seen.
    static CmILink* make(CmObject* object);
    static void dispose(CmILink* link) { link->next = nullptr; }
    static CmObject* objectOf(CmILink* link) { return link; }
    static void setPrevious(CmILink*, CmILink*) {}
    /// Found from the front.
    static CmILink* before(const CmILink* link, CmILink* first);
};

extern template class CmNodeList<CmILink>;

/// A list of CmILinks, which carry its links. One thread at a time.
class CmILinkedList : public CmLinkListOf<CmILink>
{
    DECLARE_CLASS(CmILinkedList, CmContainer)

    CmILinkedList() = default;
    CmILinkedList(const CmILinkedList& other) : CmLinkListOf() { CmILinkedList::copy(other); }
    explicit CmILinkedList(const CmContainer& other) { CmILinkedList::copy(other); }
    CmILinkedList& operator=(const CmILinkedList& other) { return assign(*this, other); }
    CmILinkedList& operator=(const CmContainer& other) { return assign(*this, other); }

    using CmLinkListOf::remove;
    /// Removes this very link.
    bool remove(CmILink* link) { return removeAbs(link); }
};

using CmILinkedListIterator = CmNodeListIterator<CmILink>;
