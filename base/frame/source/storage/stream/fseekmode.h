#pragma once

/// Where a position counts from.
enum FSeekMode : int
{
    kSeekStart = 0,
    kSeekCurrent = 1,
    kSeekEnd = 2
};
