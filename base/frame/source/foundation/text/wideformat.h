#pragma once

#include "foundation/object/types.h"

#include <cstdarg>

inline constexpr int kMaxFormattedLength = 4096;

/// Formats into 16-bit text as `vsnprintf` does into 8-bit text, numbers with the very same characters.
///
/// "%s" and "%c" take 16-bit text and a 16-bit character; "%hs" takes 8-bit text. A conversion that isn't
/// known is copied as it stands. `result` has room for `kMaxFormattedLength` characters and a terminator; what
/// goes beyond is cut. Gives the number of characters.
int formatWide(char16* result, const char16* format, va_list arguments);
