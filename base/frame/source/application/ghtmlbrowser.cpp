#include "application/ghtmlbrowser.h"

#include "application/platformservices.h"
#include "foundation/text/fstring.h"

#include <atomic>

namespace
{
std::atomic<ICustomBrowser*> gCustomBrowser{nullptr};
} // namespace

GHTMLBrowser::GHTMLBrowser(int) {}

void GHTMLBrowser::setCustomBrowser(ICustomBrowser* browser)
{
    gCustomBrowser = browser;
}

bool GHTMLBrowser::openURL(const char16* url)
{
    if (ICustomBrowser* browser = gCustomBrowser)
    {
        const ICustomBrowser::Answer answer = browser->openURL(url);
        if (answer != ICustomBrowser::kNotTaken)
            return answer == ICustomBrowser::kShown;
    }

    FString text(url);
    text.toMultiByte(kEncodingUtf8);
    PlatformServices::openURL(text.text8());
    return true;
}
