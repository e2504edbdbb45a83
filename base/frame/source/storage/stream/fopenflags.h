#pragma once

/// How a file is opened; flags are joined by `|`.
enum FOpenFlags : int
{
    /// Read access. What a URL names can be opened only with this one.
    kFileRead = 1,
    kFileWrite = 2,
    /// Opened beside others; archives open their members so.
    kFileShare = 4,
    /// Read and write access; counts as kFileWrite wherever it matters whether the file was changed.
    kFileReadWrite = 8,
    /// Unbuffered, by a descriptor of the system.
    kFileDirect = 32
};
