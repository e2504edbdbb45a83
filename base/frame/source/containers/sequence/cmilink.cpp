#include "containers/sequence/cmilink.h"

DEFINE_CLASS(CmILink, CmObject)
DEFINE_CLASS(CmIDLink, CmObject)
