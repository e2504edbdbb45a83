#include "containers/sequence/cmilinkedlist.h"

#include "containers/sequence/cmnodelistbodies.h"

CmILink* CmNodeRules<CmILink>::make(CmObject* object)
{
    CmILink* link = FCast(CmILink, object);
    return link && !link->next ? link : nullptr;
}

CmILink* CmNodeRules<CmILink>::before(const CmILink* link, CmILink* first)
{
    return findBefore(link, first);
}

template class CmNodeList<CmILink>;

DEFINE_CLASS(CmILinkedList, CmContainer)
