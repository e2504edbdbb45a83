#include "application/platformservices.h"

#include <cerrno>
#include <climits>
#include <cstdlib>

#include <linux/sockios.h>
#include <pwd.h>
#include <sys/ioctl.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

namespace
{
constexpr rlim_t kOpenFiles = 10240;
constexpr mode_t kOwnerOnly = S_IRWXU;

/// An absolute path from the environment, without a delimiter at its end. Relative ones are ignored, as the rules
/// for these variables ask.
std::string pathFromEnvironment(const char* name)
{
    const char* value = getenv(name);
    std::string path = value && *value == '/' ? value : "";
    while (path.size() > 1 && path.back() == '/')
        path.pop_back();
    return path;
}

std::string homeFolder()
{
    const std::string home = pathFromEnvironment("HOME");
    if (!home.empty())
        return home;
    const passwd* user = getpwuid(getuid());
    return user && user->pw_dir && *user->pw_dir == '/' ? user->pw_dir : "";
}

std::string folderOr(const char* variable, const char* belowHome)
{
    const std::string folder = pathFromEnvironment(variable);
    if (!folder.empty())
        return folder;
    const std::string home = homeFolder();
    return home.empty() ? home : home + belowHome;
}

bool isFolder(const std::string& path)
{
    struct stat info;
    return stat(path.c_str(), &info) == 0 && S_ISDIR(info.st_mode);
}

/// Others could have made a folder of this name before us, where everybody may write.
bool isOwnFolder(const std::string& path)
{
    struct stat info;
    return lstat(path.c_str(), &info) == 0 && S_ISDIR(info.st_mode) && info.st_uid == geteuid() &&
           (info.st_mode & (S_IWGRP | S_IWOTH)) == 0;
}
} // namespace

int PlatformServices::unsentBytes(int socket)
{
    int count = 0;
    return ioctl(socket, SIOCOUTQ, &count) == 0 ? count : -1;
}

void PlatformServices::raiseLimits()
{
    rlimit files{};
    getrlimit(RLIMIT_NOFILE, &files);
    files.rlim_cur = kOpenFiles;
    setrlimit(RLIMIT_NOFILE, &files);

    rlimit stack{};
    getrlimit(RLIMIT_STACK, &stack);
    stack.rlim_cur = stack.rlim_max;
    setrlimit(RLIMIT_STACK, &stack);
}

std::string PlatformServices::getExecutablePath()
{
    char path[PATH_MAX];
    const ssize_t length = readlink("/proc/self/exe", path, sizeof path);
    return length > 0 && length < static_cast<ssize_t>(sizeof path)
               ? std::string(path, static_cast<size_t>(length))
               : std::string();
}

std::string PlatformServices::getConfigFolder()
{
    return folderOr("XDG_CONFIG_HOME", "/.config");
}

std::string PlatformServices::getDataFolder()
{
    return folderOr("XDG_DATA_HOME", "/.local/share");
}

std::string PlatformServices::getTemporaryFolder(const std::string& name)
{
    std::string parent = pathFromEnvironment("TMPDIR");
    if (parent.empty())
        parent = "/tmp";
    const std::string folder = parent + "/" + name + " " + std::to_string(geteuid());
    return makePrivateFolder(folder) && isOwnFolder(folder) ? folder : std::string();
}

bool PlatformServices::makePrivateFolder(const std::string& path)
{
    for (size_t slash = path.find('/', 1); slash != std::string::npos; slash = path.find('/', slash + 1))
        mkdir(path.substr(0, slash).c_str(), kOwnerOnly);
    return mkdir(path.c_str(), kOwnerOnly) == 0 || (errno == EEXIST && isFolder(path));
}
