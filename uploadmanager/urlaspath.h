#pragma once

#include "storage/path/fnpath.h"

/// A URL that travels as a path, whole: taken apart as one it would lose a trailing delimiter, of a token perhaps, and
/// have its backslashes turned. One thread at a time.
class UrlAsPath : public FNPath
{
    DECLARE_COPYABLE(UrlAsPath, FNPath)

    /// `text` is UTF-8.
    explicit UrlAsPath(const char* text) { url.fromUTF8(text); }

    bool getFullPath(FString& result) const override
    {
        result = url;
        return !url.isEmpty();
    }

private:
    FString url;
};
