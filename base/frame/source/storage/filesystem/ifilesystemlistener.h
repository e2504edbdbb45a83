#pragma once

class FileSystemChange;

/// Hears of changes in the folders that it has registered with the FNMonitor. Main thread.
class IFileSystemListener
{
public:
    virtual void onFileSystemChanged(const FileSystemChange& change) = 0;

protected:
    ~IFileSystemListener() = default;
};
