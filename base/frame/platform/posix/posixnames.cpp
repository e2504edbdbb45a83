#include "storage/filesystem/platformfiles.h"

#include <algorithm>
#include <cerrno>
#include <climits>
#include <cstdlib>
#include <dirent.h>
#include <fcntl.h>
#include <memory>
#include <sys/stat.h>
#include <unistd.h>

// What is on disk by its names: questions, changes, links.

namespace
{
using PlatformFiles::Facts;
using PlatformFiles::Kind;

constexpr mode_t kFolderOfAll = 0777;
constexpr mode_t kFolderOfOwner = 0700;

int resultOf(int status)
{
    return status == 0 ? 0 : errno;
}

Kind kindOf(mode_t mode)
{
    if (S_ISREG(mode))
        return Kind::kFile;
    return S_ISDIR(mode) ? Kind::kFolder : Kind::kOther;
}

// Not every disk keeps the time of birth.
int64 birthOf(const char* path, const struct stat& facts)
{
    struct statx extended = {};
    if (statx(AT_FDCWD, path, 0, STATX_BTIME, &extended) == 0 && (extended.stx_mask & STATX_BTIME))
        return extended.stx_btime.tv_sec;
    return facts.st_mtim.tv_sec;
}

// The entries "." and ".." are no content.
int scanDirEntryFilter(const dirent* entry)
{
    const std::string name(entry->d_name);
    return name != "." && name != "..";
}

struct Freeing
{
    void operator()(void* memory) const { free(memory); }
};
} // namespace

Facts PlatformFiles::look(const std::string& path)
{
    Facts result;
    struct stat facts = {};
    if (lstat(path.c_str(), &facts) != 0)
        return result;
    result.isLink = S_ISLNK(facts.st_mode);
    if (result.isLink && stat(path.c_str(), &facts) != 0)
        return result;
    result.kind = kindOf(facts.st_mode);
    result.size = facts.st_size;
    result.created = birthOf(path.c_str(), facts);
    result.modified = facts.st_mtim.tv_sec;
    result.mode = facts.st_mode;
    return result;
}

bool PlatformFiles::isTaken(const std::string& path)
{
    struct stat facts = {};
    return lstat(path.c_str(), &facts) == 0;
}

int PlatformFiles::removeFile(const std::string& path)
{
    return resultOf(unlink(path.c_str()));
}

int PlatformFiles::removeFolder(const std::string& path)
{
    return resultOf(rmdir(path.c_str()));
}

int PlatformFiles::makeFolder(const std::string& path, bool ownerOnly)
{
    return resultOf(mkdir(path.c_str(), ownerOnly ? kFolderOfOwner : kFolderOfAll));
}

int PlatformFiles::rename(const std::string& from, const std::string& to)
{
    return resultOf(::rename(from.c_str(), to.c_str()));
}

bool PlatformFiles::isAcrossDevices(int error)
{
    return error == EXDEV;
}

int PlatformFiles::changeFolder(const std::string& path)
{
    return resultOf(chdir(path.c_str()));
}

int PlatformFiles::syncFolder(const std::string& path)
{
    const int folder = ::open(path.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (folder < 0)
        return errno;
    const int error = sync(folder);
    ::close(folder);
    return error;
}

bool PlatformFiles::list(const std::string& path, std::vector<std::string>& names)
{
    dirent** entries = nullptr;
    const int count = scandir(path.c_str(), &entries, scanDirEntryFilter, nullptr);
    if (count < 0)
        return false;
    const std::unique_ptr<dirent*, Freeing> holder(entries);
    for (int i = 0; i < count; i++)
    {
        const std::unique_ptr<dirent, Freeing> entry(entries[i]);
        names.emplace_back(entry->d_name);
    }
    std::sort(names.begin(), names.end());
    return true;
}

// Links

int PlatformFiles::makeSymlink(const std::string& path, const std::string& target)
{
    return resultOf(symlink(target.c_str(), path.c_str()));
}

int PlatformFiles::makeLink(const std::string& path, const std::string& target)
{
    return resultOf(link(target.c_str(), path.c_str()));
}

bool PlatformFiles::readSymlink(const std::string& path, std::string& target)
{
    char text[PATH_MAX];
    const ssize_t length = readlink(path.c_str(), text, sizeof(text));
    if (length < 0)
        return false;
    target.assign(text, static_cast<size_t>(length));
    return true;
}

bool PlatformFiles::resolve(const std::string& path, std::string& target)
{
    const std::unique_ptr<char, Freeing> text(realpath(path.c_str(), nullptr));
    if (!text)
        return false;
    target = text.get();
    return true;
}

// Rights and times

bool PlatformFiles::isWritable(const std::string& path)
{
    return access(path.c_str(), W_OK) == 0;
}

int PlatformFiles::setWritable(const std::string& path, bool state)
{
    struct stat facts = {};
    if (stat(path.c_str(), &facts) != 0)
        return errno;
    const mode_t rights = facts.st_mode & 07777;
    return resultOf(chmod(path.c_str(), state ? rights | S_IWUSR : rights & ~static_cast<mode_t>(S_IWUSR)));
}

bool PlatformFiles::isExecutable(const std::string& path)
{
    return look(path).kind == Kind::kFile && access(path.c_str(), X_OK) == 0;
}

bool PlatformFiles::isSame(const std::string& left, const std::string& right)
{
    struct stat leftFacts = {};
    struct stat rightFacts = {};
    return stat(left.c_str(), &leftFacts) == 0 && stat(right.c_str(), &rightFacts) == 0 &&
           leftFacts.st_dev == rightFacts.st_dev && leftFacts.st_ino == rightFacts.st_ino;
}

int PlatformFiles::copyRights(const std::string& from, const std::string& to)
{
    struct stat facts = {};
    if (stat(from.c_str(), &facts) != 0)
        return errno;
    return resultOf(chmod(to.c_str(), facts.st_mode & 0777));
}

int PlatformFiles::copyAttributes(const std::string& from, const std::string& to)
{
    struct stat facts = {};
    if (stat(from.c_str(), &facts) != 0)
        return errno;
    const timespec times[] = {facts.st_atim, facts.st_mtim};
    if (const int error = copyRights(from, to))
        return error;
    return resultOf(utimensat(AT_FDCWD, to.c_str(), times, 0));
}
