#pragma once

#include "foundation/object/types.h"

// Natural order: runs of digits compare by their value, so that "Take 9" sorts before "Take 10".
// Runs of one value sort by their number of leading zeros; only characters below 256 can be digits.
// A null text sorts before every other. Negative, 0 or positive.

int strnatcmp8(const char* a, const char* b, bool caseSensitive);
int strnatcmp16(const char16* a, const char16* b, bool caseSensitive);
