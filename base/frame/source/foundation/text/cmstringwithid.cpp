#include "foundation/text/cmstringwithid.h"

DEFINE_CLASS(CmStringWithId, CmString)
