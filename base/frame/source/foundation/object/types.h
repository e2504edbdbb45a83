#pragma once

#include <cstddef>
#include <cstdint>

// Widths that are part of a file form or an interface; elsewhere plain int and unsigned do.
using int16 = std::int16_t;
using int32 = std::int32_t;
using int64 = std::int64_t;
using uint8 = std::uint8_t;
using uint16 = std::uint16_t;
using uint32 = std::uint32_t;
using uint64 = std::uint64_t;

/// One element of 16-bit text: UTF-16 in host order, one element counting as one character.
using char16 = char16_t;

/// Result codes of interface operations.
inline constexpr int32 kResultOk = 0;
inline constexpr int32 kNoInterface = -1;
