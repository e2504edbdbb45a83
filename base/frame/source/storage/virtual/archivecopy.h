#pragma once

class FPath;
class UProgressHook;

/// Copies a file between two places of which either may lie in an archive. With a folder as `to`, which its type
/// tells, the file's name is added. Fails as `FFileSystem::copyFile` does, and where both are one file. Thread-safe.
bool copyAcrossArchives(FPath* from, FPath* to, UProgressHook* hook, int* error);

/// Whether the path leads into a mounted archive.
bool isInArchive(const FPath* path);
