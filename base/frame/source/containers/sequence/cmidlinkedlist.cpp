#include "containers/sequence/cmidlinkedlist.h"

#include "containers/sequence/cmnodelistbodies.h"

CmIDLink* CmNodeRules<CmIDLink>::make(CmObject* object)
{
    CmIDLink* link = FCast(CmIDLink, object);
    return link && !link->next && !link->previous ? link : nullptr;
}

template class CmNodeList<CmIDLink>;

DEFINE_CLASS(CmIDLinkedList, CmContainer)

bool CmIDLinkedList::remove(CmIDLink* link)
{
    return link && isHere(link) && removeAbs(link);
}

bool CmIDLinkedList::removeAbs(CmIDLink* link)
{
    if (!link || !isBetweenNeighbours(link))
        return false;
    testDelete(unlink(link->previous, link));
    return true;
}

bool CmIDLinkedList::isBetweenNeighbours(const CmIDLink* link) const
{
    const CmIDLink* fromBefore = link->previous ? link->previous->next : _first;
    const CmIDLink* fromBehind = link->next ? link->next->previous : _last;
    return fromBefore == link && fromBehind == link;
}

bool CmIDLinkedList::isHere(const CmIDLink* link) const
{
    const CmIDLink* backwards = link;
    const CmIDLink* forwards = link;
    while (backwards->previous && forwards->next)
    {
        backwards = backwards->previous;
        forwards = forwards->next;
    }
    return !backwards->previous ? backwards == _first : forwards == _last;
}
