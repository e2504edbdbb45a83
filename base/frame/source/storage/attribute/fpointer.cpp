#include "storage/attribute/fpointer.h"

#include <cstdint>
#include <functional>

bool FPointer::isEqual(const CmObject* other) const
{
    const FPointer* pointer = FCast(FPointer, other);
    return pointer && pointer->address == address;
}

int FPointer::compare(const CmObject* other) const
{
    const FPointer* pointer = FCast(FPointer, other);
    if (!pointer)
        return -1;
    if (pointer->address == address)
        return 0;
    return std::less<>()(address, pointer->address) ? -1 : 1;
}

unsigned FPointer::hash(unsigned size) const
{
    return static_cast<unsigned>(reinterpret_cast<std::uintptr_t>(address) % size);
}
