#pragma once

#include "foundation/object/types.h"

/// Something that shows web pages in place of the desktop's browser. Thread-safe.
class ICustomBrowser
{
public:
    enum Answer
    {
        kNotTaken, ///< the desktop's browser shows the page
        kShown,
        kFailed
    };

    virtual Answer openURL(const char16* url) = 0;

protected:
    ~ICustomBrowser() = default;
};

/// Shows web pages to the user. Thread-safe.
class GHTMLBrowser
{
public:
    /// `browserKind` 1 is the user's default browser, the only kind.
    explicit GHTMLBrowser(int browserKind = 1);

    /// False only where a custom browser failed. What can't be a URL is dropped silently.
    bool openURL(const char16* url);

    /// Asked before the desktop's browser. Borrowed; null takes it away.
    static void setCustomBrowser(ICustomBrowser* browser);
};
