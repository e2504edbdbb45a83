#include "containers/sequence/cmstack.h"

DEFINE_CLASS(CmStack, CmLinkedList)
