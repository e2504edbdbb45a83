#pragma once

class FFileSystem;
class FPath;

/// Finds the file system behind a path that leads into a mounted archive. Thread-safe.
class IArchiveLookup
{
public:
    virtual ~IArchiveLookup() = default;
    virtual bool isArchivePath(const FPath* path) = 0;
    /// With a reference for the caller; null for a path that leads into no archive.
    virtual FFileSystem* getFileSystem(const FPath* path) = 0;
    /// The path inside the archive, with a reference for the caller.
    virtual FPath* getPath(const FPath& path) = 0;

    /// Null while there are no archives.
    static IArchiveLookup* instance();
    /// Not owned. Set before other threads use files.
    static void setInstance(IArchiveLookup* lookup);
};
