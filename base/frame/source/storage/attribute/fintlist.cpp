#include "storage/attribute/fintlist.h"

DEFINE_CLASS(FIntList, FAttrList)
