#include "uploadmanager/sharedbrowser.h"

#include "application/ghtmlbrowser.h"
#include "foundation/thread/flockscope.h"

namespace
{
FLock browserLock("browser");
GHTMLBrowser* browser = nullptr;

// Only the making is locked: opening a page may take as long as the desktop likes.
GHTMLBrowser* getBrowser()
{
    FLockScope guard(browserLock);
    if (!browser)
        browser = new GHTMLBrowser(1);
    return browser;
}
} // namespace

bool openInSharedBrowser(const char16* url)
{
    return getBrowser()->openURL(url);
}

void deleteSharedBrowser()
{
    delete browser;
    browser = nullptr;
}
