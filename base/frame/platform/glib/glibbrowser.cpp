#include "application/platformservices.h"
#include "storage/filesystem/desktopservices.h"

void PlatformServices::openURL(const std::string& url)
{
    // A desktop without a browser is none of the caller's business.
    (void)DesktopServices::openUrl(url.c_str());
}
