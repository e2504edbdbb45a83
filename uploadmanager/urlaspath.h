#pragma once

#include "storage/path/filenametext.h"
#include "storage/path/fnpath.h"

/// A URL that travels as a path, whole: taken apart as one it would lose a trailing delimiter, of a token perhaps, and
/// have its backslashes turned. One thread at a time.
class UrlAsPath : public FNPath
{
    DECLARE_COPYABLE(UrlAsPath, FNPath)

    /// `bytes` as the desktop gave them.
    explicit UrlAsPath(const char* bytes) { FileNameText::fromBytes(bytes, url); }

    bool getFullPath(FString& result) const override
    {
        result = url;
        return !url.isEmpty();
    }

private:
    FString url;
};
