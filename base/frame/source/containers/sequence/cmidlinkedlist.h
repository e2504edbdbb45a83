#pragma once

#include "containers/sequence/cmilink.h"
#include "containers/sequence/cmlinklistof.h"

template <>
struct CmNodeRules<CmIDLink>
{
    static constexpr const char* kListName = "CmIDLinkedList";
    /// Null for what is no CmIDLink or stands in a list already; of a list's only element this can't be seen.
    static CmIDLink* make(CmObject* object);
    static void dispose(CmIDLink* link) { link->next = link->previous = nullptr; }
    static CmObject* objectOf(CmIDLink* link) { return link; }
    static void setPrevious(CmIDLink* link, CmIDLink* before) { link->previous = before; }
    static CmIDLink* before(const CmIDLink* link, CmIDLink*) { return link->previous; }
};

extern template class CmNodeList<CmIDLink>;

/// A list of CmIDLinks, which carry its links, both ways. One thread at a time.
class CmIDLinkedList : public CmLinkListOf<CmIDLink>
{
    DECLARE_CLASS(CmIDLinkedList, CmContainer)

    CmIDLinkedList() = default;
    CmIDLinkedList(const CmIDLinkedList& other) : CmLinkListOf() { CmIDLinkedList::copy(other); }
    explicit CmIDLinkedList(const CmContainer& other) { CmIDLinkedList::copy(other); }
    CmIDLinkedList& operator=(const CmIDLinkedList& other) { return assign(*this, other); }
    CmIDLinkedList& operator=(const CmContainer& other) { return assign(*this, other); }

    using CmLinkListOf::remove;
    using CmLinkListOf::removeAbs;
    /// Removes this very link. One that stands elsewhere gives false and stays untouched: the way to the nearer end
    /// of its list is walked to see.
    bool remove(CmIDLink* link);
    /// The same in constant time: only the neighbours are looked at, so the link must not be amid another list.
    bool removeAbs(CmIDLink* link);

private:
    bool isBetweenNeighbours(const CmIDLink* link) const;
    bool isHere(const CmIDLink* link) const;
};

using CmIDLinkedListIterator = CmNodeListIterator<CmIDLink>;
