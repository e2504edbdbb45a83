#pragma once

#include "foundation/object/types.h"

// UTF-8 in one pass. The result has to be large enough for the worst case; it gets no terminator, and the number of
// elements written is returned.

/// Writes at most `length` elements. Each byte that belongs to no well-formed character gives one `loss`.
unsigned decodeUtf8(const char* text, unsigned length, char16* result, char16 loss);

/// Writes at most `3 * length` bytes. Each half of a surrogate pair that stands alone gives one `loss`.
unsigned encodeUtf8(const char16* text, unsigned length, char* result, char loss);

/// The characters before the first one above 127 alone: writes as many bytes, at most `length`.
unsigned encodeAsciiStart(const char16* text, unsigned length, char* result);
