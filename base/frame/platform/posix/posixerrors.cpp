#include "storage/filesystem/platformfiles.h"

#include <cerrno>
#include <cstring>

PlatformFiles::Trouble PlatformFiles::meaningOf(int error)
{
    switch (error)
    {
    case 0:
        return Trouble::kNone;
    case ENOENT:
        return Trouble::kNotFound;
    case EIO:
        return Trouble::kReadWrite;
    // Other platforms number a name that is too long 63; the number that it has here means streams, which no
    // file operation reports, so files with errors from elsewhere are understood too.
    case ENAMETOOLONG:
    case ENOSR:
        return Trouble::kNameTooLong;
    case ENOSPC:
        return Trouble::kDiskFull;
    case EROFS:
        return Trouble::kReadOnly;
    case EPERM:
    case EACCES:
        return Trouble::kNotAllowed;
    default:
        return Trouble::kOther;
    }
}

std::string PlatformFiles::describe(int error)
{
    return strerror(error);
}
