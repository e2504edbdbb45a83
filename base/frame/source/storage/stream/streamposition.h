#pragma once

#include "foundation/object/types.h"

#include <limits>

/// `position` moved by `distance`, and no further than positions reach: both may come from a file.
constexpr int64 movePosition(int64 position, int64 distance)
{
    constexpr int64 kFirst = std::numeric_limits<int64>::min();
    constexpr int64 kLast = std::numeric_limits<int64>::max();
    if (distance > 0 && position > kLast - distance)
        return kLast;
    if (distance < 0 && position < kFirst - distance)
        return kFirst;
    return position + distance;
}

/// How far `last` is from `first`, or as far as distances reach.
constexpr int64 distanceBetween(int64 first, int64 last)
{
    constexpr int64 kFirst = std::numeric_limits<int64>::min();
    constexpr int64 kLast = std::numeric_limits<int64>::max();
    if (first < 0 && last > kLast + first)
        return kLast;
    if (first > 0 && last < kFirst + first)
        return kFirst;
    return last - first;
}
