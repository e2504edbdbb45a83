#include "storage/attribute/iarchiveerrorhook.h"
#include "storage/attribute/iattributelist.h"

DEFINE_INTERFACE_ID(IArchiveErrorHook, 0x5C1E90D7, 0xB2A44F08, 0x9D3361EA, 0x7F80C5B4)
DEFINE_INTERFACE_ID(IAttributeList, 0x8E07A3F2, 0x41D94CB6, 0xA85BD21C, 0x0E6F9A73)
