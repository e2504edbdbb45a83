#pragma once

#include "foundation/object/types.h"

#include <cstddef>

/// Bucket numbers below `size` for zero-terminated text; 0 for a null or empty one.
///
/// They depend on the width: an 8-bit character counts with its sign.
unsigned hashString8(const char* text, unsigned size);
unsigned hashString16(const char16* text, unsigned size);

/// Of a text whose length is known, which needs no terminator.
unsigned hashString8(const char* text, size_t length, unsigned size);
unsigned hashString16(const char16* text, size_t length, unsigned size);
