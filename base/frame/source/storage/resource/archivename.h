#pragma once

class ConstString;

/// Names in archives. Thread-safe.
namespace ArchiveName
{
/// What a table can give back: no more characters, and a terminator.
inline constexpr int kMaxName = 256;

/// Whether a file or folder of that name can be made in a folder and be nowhere else: not empty, no "." or "..", no
/// delimiter of any platform.
bool isSafe(const ConstString& name);
/// Whether the name comes out of a table as it went in: short enough, and characters that UTF-8 has.
bool isStorable(const ConstString& name);
} // namespace ArchiveName
