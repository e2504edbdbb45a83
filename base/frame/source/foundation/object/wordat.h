#pragma once

#include "foundation/object/types.h"

#include <cstring>

/// Eight bytes from any address, as the number that they are in memory.
inline uint64 wordAt(const void* bytes)
{
    uint64 word;
    memcpy(&word, bytes, sizeof(word));
    return word;
}
