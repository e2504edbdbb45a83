#include "containers/keyed/cmbtreedictionary.h"

#include "containers/keyed/cmdictionaryofbodies.h"

template class CmDictionaryOf<CmBTree>;

DEFINE_CLASS(CmBTreeDictionary, CmBTree)
