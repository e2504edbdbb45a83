#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/object/iptr.h"
#include "storage/path/fnpath.h"

/// What happened to a folder on disk, as it travels in the message "PathChanged". Immutable once it is sent.
class FileSystemChange : public CmObject
{
    DECLARE_COPYABLE(FileSystemChange, CmObject)

    enum Kind
    {
        kWritten = 1, ///< created or changed by this program
        kRemoved = 2,
        kChanged = 3
    };

    /// Copies are made of the paths; `changedNewPath` may be null.
    FileSystemChange(int32 changeKind, const FNPath* changedPath, const FNPath* changedNewPath);

    int32 getKind() const { return kind; }
    FNPath* getPath() const { return path; }
    /// Null where nothing was moved.
    FNPath* getNewPath() const { return newPath; }

private:
    int32 kind;
    IPtr<FNPath> path;
    IPtr<FNPath> newPath;
    [[maybe_unused]] int32 reserved = 0;
};
