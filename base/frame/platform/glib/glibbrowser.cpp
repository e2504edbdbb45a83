#include "application/platformservices.h"

#include <gio/gio.h>

namespace
{
bool isURL(const char* text)
{
    return g_uri_is_valid(text, G_URI_FLAGS_PARSE_RELAXED, nullptr) != FALSE;
}
} // namespace

// The desktop's handler gets the text as it is: GFile, which rewrites URLs, is asked only where no program has
// registered for the scheme.
void PlatformServices::openURL(const std::string& url)
{
    if (isURL(url.c_str()))
        g_app_info_launch_default_for_uri(url.c_str(), nullptr, nullptr);
}
