#pragma once

#include <string>

class FNPath;

/// How paths are spelled on disk. Thread-safe.
namespace DiskName
{
/// The bytes under which the disk has `path`. A component that isn't found as it is written is looked for in
/// its decomposed form, then among all names that compose to it; where there is none it stays as it is
/// written.
std::string find(const FNPath& path);
} // namespace DiskName
