#include "storage/filesystem/ivolumewatcher.h"

#include <glib-unix.h>

#include <fcntl.h>
#include <unistd.h>

namespace
{
/// Follows the kernel's table of mounts by the main loop: a change of it counts as an error on the open file.
///
/// GIO's own monitor would do, but starts a thread for the tables of older systems.
class VolumeWatcher : public IVolumeWatcher
{
public:
    explicit VolumeWatcher(IVolumeListener& listener)
        : table(open("/proc/self/mountinfo", O_RDONLY | O_CLOEXEC)),
          source(table < 0 ? 0 : g_unix_fd_add(table, kChanged, &VolumeWatcher::tell, &listener))
    {
    }
    ~VolumeWatcher() override
    {
        if (table < 0)
            return;
        g_source_remove(source);
        close(table);
    }
    VolumeWatcher(const VolumeWatcher&) = delete;
    VolumeWatcher& operator=(const VolumeWatcher&) = delete;

private:
    static constexpr auto kChanged = static_cast<GIOCondition>(G_IO_ERR | G_IO_PRI);

    static gboolean tell(int, GIOCondition, gpointer listener)
    {
        static_cast<IVolumeListener*>(listener)->onVolumesChanged();
        return G_SOURCE_CONTINUE;
    }

    int table;
    guint source;
};
} // namespace

std::unique_ptr<IVolumeWatcher> IVolumeWatcher::make(IVolumeListener& listener)
{
    return std::make_unique<VolumeWatcher>(listener);
}
