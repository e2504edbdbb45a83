#pragma once

#include "containers/sequence/cmilink.h"
#include "containers/sequence/cmnodelist.h"

template <>
struct CmNodeRules<CmIDLink>
{
    /// Null for what is no CmIDLink or stands in a list already; of a list's only element this can't be seen.
    static CmIDLink* make(CmObject* object);
    static void dispose(CmIDLink* link) { link->next = link->previous = nullptr; }
    static CmObject* objectOf(CmIDLink* link) { return link; }
    static void setPrevious(CmIDLink* link, CmIDLink* before) { link->previous = before; }
    static CmIDLink* before(const CmIDLink* link, CmIDLink*) { return link->previous; }
};

extern template class CmNodeList<CmIDLink>;

/// A list without nodes: its elements are CmIDLinks, which carry their links; anything else is refused.
///
/// An element can stand in only one such list at a time. So a copy of the list holds copies in mode 1 and is empty
/// in the other modes. One thread at a time.
class CmIDLinkedList : public CmNodeList<CmIDLink>
{
    DECLARE_CLASS(CmIDLinkedList, CmContainer)

    CmIDLinkedList() = default;
    CmIDLinkedList(const CmIDLinkedList& other) : CmNodeList(other) { CmIDLinkedList::copy(other); }
    explicit CmIDLinkedList(const CmContainer& other) { CmIDLinkedList::copy(other); }
    CmIDLinkedList& operator=(const CmIDLinkedList& other)
    {
        return *this = static_cast<const CmContainer&>(other);
    }
    CmIDLinkedList& operator=(const CmContainer& other);

    void copy(const CmContainer& source) override;

    using CmNodeList::remove;
    using CmNodeList::removeAbs;
    /// Removes this very link. One that stands elsewhere gives false and stays untouched: the way to the nearer end
    /// of its list is walked to see.
    bool remove(CmIDLink* link);
    /// The same in constant time: only the neighbours are looked at, so the link must not be amid another list.
    bool removeAbs(CmIDLink* link);

    /// Take all elements of the other list with their references, in constant time; the modes stay.
    void appendList(CmIDLinkedList& other) { appendNodes(other); }
    void prependList(CmIDLinkedList& other) { prependNodes(other); }
    /// Removes what is here and takes the elements and the mode of the other list, which is then empty.
    void takeOver(CmIDLinkedList& other);
    /// Exchanges the elements and the modes.
    void swap(CmIDLinkedList& other) { swapNodes(other); }

private:
    bool isBetweenNeighbours(const CmIDLink* link) const;
    bool isHere(const CmIDLink* link) const;
};

using CmIDLinkedListIterator = CmNodeListIterator<CmIDLink>;
