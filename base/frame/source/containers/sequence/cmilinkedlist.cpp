#include "containers/sequence/cmilinkedlist.h"

#include "containers/sequence/cmnodelistbodies.h"

CmILink* CmNodeRules<CmILink>::make(CmObject* object)
{
    CmILink* link = FCast(CmILink, object);
    return link && !link->next ? link : nullptr;
}

CmILink* CmNodeRules<CmILink>::before(const CmILink* link, CmILink* first)
{
    CmILink* found = first == link ? nullptr : first;
    while (found && found->next != link)
        found = found->next;
    return found;
}

template class CmNodeList<CmILink>;

DEFINE_CLASS(CmILinkedList, CmContainer)

CmILinkedList& CmILinkedList::operator=(const CmContainer& other)
{
    if (&other == this)
        return *this;
    removeAll();
    copy(other);
    return *this;
}

void CmILinkedList::copy(const CmContainer& source)
{
    if (source.getOwnership() == kTaken)
        CmContainer::copy(source);
    else if (&source != this)
        setOwnership(source.getOwnership());
}

void CmILinkedList::takeOver(CmILinkedList& other)
{
    if (&other == this)
        return;
    removeAll();
    setOwnership(other.getOwnership());
    appendList(other);
}
