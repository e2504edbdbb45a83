#include "containers/sequence/cmqueue.h"

DEFINE_CLASS(CmQueue, CmLinkedList)
