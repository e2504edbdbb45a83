#include "containers/keyed/cmhashdictionary.h"

#include "containers/keyed/cmdictionaryofbodies.h"

template class CmDictionaryOf<CmHashTable>;

DEFINE_CLASS(CmHashDictionary, CmHashTable)
