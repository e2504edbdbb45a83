#pragma once

#include <memory>

/// Hears that the volumes may be others now. Main thread.
class IVolumeListener
{
public:
    virtual void onVolumesChanged() = 0;

protected:
    ~IVolumeListener() = default;
};

/// The platform's means to notice that a volume came or went, for as long as it lives. Main thread.
class IVolumeWatcher
{
public:
    virtual ~IVolumeWatcher() = default;

    /// `listener` is borrowed and called from the main event loop.
    static std::unique_ptr<IVolumeWatcher> make(IVolumeListener& listener);
};
