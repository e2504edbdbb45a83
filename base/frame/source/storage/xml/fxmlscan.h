#pragma once

#include "foundation/object/types.h"

#include <bit>
#include <cstring>

/// How the older parser looks for the byte that ends a run, in a text that ends with zeros.
namespace FXmlScan
{
/// So many bytes may be read at once: as many zeros must stand behind the text.
inline constexpr int kStep = 16;

/// The place in memory of the first byte that isn't 0.
inline unsigned firstSet(uint64 bytes)
{
    const int bits =
        std::endian::native == std::endian::little ? std::countr_zero(bytes) : std::countl_zero(bytes);
    return static_cast<unsigned>(bits) / 8;
}

/// The first byte that `isEnd` tells; zero must be one. Sixteen bytes are asked together, without a test between them,
/// which fits in wide registers if `isEnd` is calculated without conditions.
template <class Predicate>
inline const char* findEnd(const char* begin, Predicate isEnd)
{
    constexpr int kHalf = sizeof(uint64);
    for (;; begin += kStep)
    {
        uint8 ends[kStep];
        for (int i = 0; i < kStep; i++)
            ends[i] = isEnd(static_cast<uint8>(begin[i])) ? 0xFF : 0;
        uint64 halves[kStep / kHalf];
        memcpy(halves, ends, sizeof(ends));
        if (halves[0] != 0)
            return begin + firstSet(halves[0]);
        if (halves[1] != 0)
            return begin + kHalf + firstSet(halves[1]);
    }
}
} // namespace FXmlScan
