#include "storage/filesystem/volumewatch.h"

#include "storage/filesystem/fnfilesystem.h"
#include "storage/filesystem/platformfiles.h"
#include "storage/path/fnpath.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace
{
using Roots = std::vector<std::string>;

Roots listRoots()
{
    Roots roots;
    for (const PlatformFiles::Volume& volume : PlatformFiles::listVolumes())
        roots.push_back(volume.mountPoint);
    std::sort(roots.begin(), roots.end());
    // What is mounted over another volume has the same root.
    roots.erase(std::unique(roots.begin(), roots.end()), roots.end());
    return roots;
}

/// Raises the event for each root that only `roots` has.
void raiseEvents(FNFileSystem& fileSystem, const char* eventName, const Roots& roots, const Roots& others)
{
    Roots own;
    std::set_difference(roots.begin(), roots.end(), others.begin(), others.end(), std::back_inserter(own));
    for (const std::string& root : own)
    {
        FNPath path(FPath::kFolder);
        path.fromPlatformPath(root.c_str());
        fileSystem.onMountEvent(eventName, &path);
    }
}
} // namespace

VolumeWatch::VolumeWatch(FNFileSystem& owner)
    : fileSystem(owner),
      known(listRoots()),
      watcher(IVolumeWatcher::make(*this))
{
}

void VolumeWatch::onVolumesChanged()
{
    const Roots former = std::exchange(known, listRoots());
    raiseEvents(fileSystem, "VolUnmount", former, known);
    raiseEvents(fileSystem, "VolMount", known, former);
}
