#include "containers/sequence/cmdlinkedlist.h"

#include "containers/sequence/cmnodelistbodies.h"

template class CmNodeList<CmDLinkedNode>;

DEFINE_CLASS(CmDLinkedList, CmContainer)
