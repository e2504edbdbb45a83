#include "storage/filesystem/ivolumewatcher.h"

#include <gio/gunixmounts.h>

namespace
{
/// Follows the kernel's table of mounts by the main loop.
class VolumeWatcher : public IVolumeWatcher
{
public:
    explicit VolumeWatcher(IVolumeListener& listener)
        : monitor(g_unix_mount_monitor_get()),
          handler(g_signal_connect_swapped(monitor, "mounts-changed", G_CALLBACK(&tell), &listener))
    {
    }
    ~VolumeWatcher() override
    {
        g_signal_handler_disconnect(monitor, handler);
        g_object_unref(monitor);
    }
    VolumeWatcher(const VolumeWatcher&) = delete;
    VolumeWatcher& operator=(const VolumeWatcher&) = delete;

private:
    static void tell(IVolumeListener* listener) { listener->onVolumesChanged(); }

    GUnixMountMonitor* monitor;
    gulong handler;
};
} // namespace

std::unique_ptr<IVolumeWatcher> IVolumeWatcher::make(IVolumeListener& listener)
{
    return std::make_unique<VolumeWatcher>(listener);
}
