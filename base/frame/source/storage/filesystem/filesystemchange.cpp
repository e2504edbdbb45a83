#include "storage/filesystem/filesystemchange.h"

namespace
{
IPtr<FNPath> copyOf(const FNPath* path)
{
    return path ? adopt(new FNPath(*path)) : nullptr;
}
} // namespace

FileSystemChange::FileSystemChange(int32 changeKind, const FNPath* changedPath, const FNPath* changedNewPath)
    : kind(changeKind),
      path(copyOf(changedPath)),
      newPath(copyOf(changedNewPath))
{
}
