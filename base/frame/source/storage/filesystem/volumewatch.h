#pragma once

#include "storage/filesystem/ivolumewatcher.h"

#include <string>
#include <vector>

class FNFileSystem;

/// Raises the mount events of the file system: it compares the volumes with those of before. Main thread.
class VolumeWatch final : private IVolumeListener
{
public:
    /// `owner` is borrowed, and gets the events until the watch goes.
    explicit VolumeWatch(FNFileSystem& owner);

private:
    void onVolumesChanged() override;

    FNFileSystem& fileSystem;
    // Their roots, in order.
    std::vector<std::string> known;
    std::unique_ptr<IVolumeWatcher> watcher;
};
