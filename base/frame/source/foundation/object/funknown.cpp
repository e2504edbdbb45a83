#include "foundation/object/funknown.h"

#include "foundation/object/fatomic.h"

#include <cstring>

DEFINE_INTERFACE_ID(FUnknown, 0x00000000, 0x00000000, 0xC0000000, 0x00000046)

int FUnknown::atomicAdd(int& value, int delta)
{
    return FAtomicAdd(value, delta) + delta;
}

bool isSameInterface(const char* interfaceID, const FUID& wanted)
{
    return memcmp(interfaceID, static_cast<const char*>(wanted), 16) == 0;
}
