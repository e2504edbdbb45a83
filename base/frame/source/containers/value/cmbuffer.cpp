#include "containers/value/cmbuffer.h"

#include <algorithm>

DEFINE_CLASS(CmBuffer, CmObject)

bool CmBuffer::isEqual(const CmObject* other) const
{
    const auto* block = FCast(CmBuffer, other);
    return block ? *this == *block : CmObject::isEqual(other);
}

unsigned CmBuffer::hash(unsigned size) const
{
    constexpr uint32 kSample = 64;
    unsigned sum = memSize;
    for (uint32 i = 0; i < std::min(memSize, kSample); i++)
        sum = sum * 31 + static_cast<uint8>(buffer[i]);
    return sum % size;
}
