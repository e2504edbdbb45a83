#include "storage/filesystem/platformfiles.h"

#include <algorithm>
#include <cstdio>
#include <iterator>
#include <memory>
#include <mntent.h>
#include <string_view>
#include <sys/stat.h>
#include <sys/statvfs.h>
#include <sys/sysmacros.h>

// Volumes, as they are mounted.

namespace
{
using PlatformFiles::Medium;
using PlatformFiles::Volume;

constexpr const char* kMountTable = "/proc/self/mounts";

constexpr std::string_view kNetworkSystems[] = {"nfs", "nfs4", "cifs",       "smb3",           "smbfs",
                                                "afs", "ceph", "fuse.sshfs", "fuse.rclone",    "davfs",
                                                "9p",  "coda", "glusterfs",  "fuse.gvfsd-fuse"};
constexpr std::string_view kOpticalSystems[] = {"iso9660", "udf"};
// Where a desktop puts what the user plugs in.
constexpr std::string_view kUserPlaces[] = {"/media/", "/run/media/", "/mnt/"};

template <size_t size>
bool contains(const std::string_view (&texts)[size], std::string_view text)
{
    return std::find(std::begin(texts), std::end(texts), text) != std::end(texts);
}

bool isInUserPlace(std::string_view mountPoint)
{
    return std::any_of(std::begin(kUserPlaces), std::end(kUserPlaces),
                       [mountPoint](std::string_view place) { return mountPoint.starts_with(place); });
}

bool isAtOrBelow(std::string_view path, std::string_view folder)
{
    if (folder == "/")
        return true;
    return path.starts_with(folder) && (path.size() == folder.size() || path[folder.size()] == '/');
}

// A partition has its disk's entry one folder up.
bool isRemovable(const char* device)
{
    struct stat facts = {};
    if (stat(device, &facts) != 0 || !S_ISBLK(facts.st_mode))
        return false;
    const std::string entry =
        "/sys/dev/block/" + std::to_string(major(facts.st_rdev)) + ":" + std::to_string(minor(facts.st_rdev));
    for (const char* place : {"/removable", "/../removable"})
        if (std::FILE* file = std::fopen((entry + place).c_str(), "r"))
        {
            const int answer = std::fgetc(file);
            std::fclose(file);
            return answer == '1';
        }
    return false;
}

Medium mediumOf(const mntent& entry)
{
    if (contains(kNetworkSystems, entry.mnt_type))
        return Medium::kNetwork;
    if (contains(kOpticalSystems, entry.mnt_type))
        return Medium::kOptical;
    return isRemovable(entry.mnt_fsname) ? Medium::kRemovable : Medium::kFixed;
}

template <class Visit>
void visitMounts(Visit visit)
{
    struct Closing
    {
        void operator()(std::FILE* file) const { endmntent(file); }
    };
    const std::unique_ptr<std::FILE, Closing> table(setmntent(kMountTable, "re"));
    if (!table)
        return;
    mntent entry = {};
    char texts[8192];
    while (getmntent_r(table.get(), &entry, texts, sizeof(texts)))
        visit(entry);
}
} // namespace

std::vector<Volume> PlatformFiles::listVolumes()
{
    std::vector<Volume> volumes = {{"/", Medium::kFixed}};
    visitMounts(
        [&volumes](const mntent& entry)
        {
            // What is mounted later at the same place hides what was there before.
            if (std::string_view(entry.mnt_dir) == "/")
                volumes.front().medium = ::mediumOf(entry);
            else if (isInUserPlace(entry.mnt_dir))
                volumes.push_back({entry.mnt_dir, ::mediumOf(entry)});
        });
    return volumes;
}

Medium PlatformFiles::mediumOf(const std::string& path)
{
    Medium medium = Medium::kFixed;
    std::string place;
    if (!resolve(path, place))
        return medium;
    size_t longest = 0;
    visitMounts(
        [&](const mntent& entry)
        {
            const std::string_view mountPoint(entry.mnt_dir);
            if (mountPoint.size() < longest || !isAtOrBelow(place, mountPoint))
                return;
            longest = mountPoint.size();
            medium = ::mediumOf(entry);
        });
    return medium;
}

bool PlatformFiles::freeBytes(const std::string& path, uint64& available, uint64& total)
{
    struct statvfs facts = {};
    if (statvfs(path.c_str(), &facts) != 0)
        return false;
    available = uint64{facts.f_bavail} * facts.f_frsize;
    total = uint64{facts.f_blocks} * facts.f_frsize;
    return true;
}
