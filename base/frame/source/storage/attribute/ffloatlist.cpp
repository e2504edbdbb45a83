#include "storage/attribute/ffloatlist.h"

DEFINE_CLASS(FFloatList, FAttrList)
