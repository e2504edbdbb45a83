#pragma once

#include "foundation/object/types.h"

#include <string>

class FMemoryStream;
class FStream;

// Reading what a file gives the size of: memory grows only with the bytes that really come.

/// The longest name of a class that is read.
inline constexpr int kMaxStoredName = 1024;

/// Appends `count` bytes; false where the stream has fewer.
bool readBounded(FStream& stream, int64 count, FMemoryStream& result);

/// Reads a text of FStreamer::writeStr8; false where it is cut off, not terminated or longer than `kMaxStoredName`.
bool readBoundedStr8(FStream& stream, std::string& result);
