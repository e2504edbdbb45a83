#pragma once

#include "foundation/object/types.h"

#include <cstddef>

/// Bucket numbers below `size` for zero-terminated text; 0 for a null or empty one.
///
/// They depend on the width: an 8-bit character counts with its sign.
unsigned hashString8(const char* text, unsigned size);
unsigned hashString16(const char16* text, unsigned size);

/// A bucket number, and a mark that tells apart most texts which share it: the hash before its last remainder, cut to
/// 32 bits. Equal texts that are hashed for one `size` have one mark, whatever their width is, or one of them has 0,
/// which tells nothing.
struct TextHash
{
    unsigned bucket;
    uint32 mark;
};
/// Of a text whose length is known, which needs no terminator.
TextHash hashString8(const char* text, size_t length, unsigned size);
TextHash hashString16(const char16* text, size_t length, unsigned size);
