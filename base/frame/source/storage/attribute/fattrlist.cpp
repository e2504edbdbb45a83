#include "storage/attribute/fattrlist.h"

DEFINE_ABSTRACT_CLASS(FAttrList, CmObject)
