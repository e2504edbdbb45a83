#pragma once

#include <memory>

/// The platform's means to watch folders. `wait` belongs to one thread; all else is thread-safe.
class IFileWatcher
{
public:
    enum class Happening
    {
        kTimeout,
        kWoken,   ///< `wake` was called
        kFailed,  ///< nothing will be told any more
        kRemoved, ///< the folder was deleted, moved or unmounted; its number is void now
        kChanged, ///< something in the folder was
        kLost     ///< too much happened at once: anything may have changed
    };

    virtual ~IFileWatcher() = default;
    /// The number under which the folder's changes are told; the same one for a folder that is watched
    /// already. -1 where it can't be watched.
    virtual int add(const char* folder) = 0;
    virtual void remove(int number) = 0;
    /// Waits for the next happening, `timeoutMs` at most or, if negative, for ever. `number` takes the
    /// folder's.
    virtual Happening wait(int timeoutMs, int& number) = 0;
    /// Makes `wait` return, also the next one.
    virtual void wake() = 0;

    /// Null where the platform can't watch.
    static std::unique_ptr<IFileWatcher> make();
};
