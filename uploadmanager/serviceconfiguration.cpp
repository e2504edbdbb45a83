#include "uploadmanager/serviceconfiguration.h"

#include "application/ucontroller.h"
#include "storage/archive/fxmlarchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/path/fnpath.h"
#include "uploadmanager/wiretext.h"

namespace
{
constexpr const char* kPublicApiHost = "api.soundcloud.com";
constexpr const char* kPublicWebHost = "soundcloud.com";

FString makeUrl(const char* hostKey, const char* publicHost, const char* path)
{
    FString host;
    FAttributes attributes;
    if (!FXmlArchive::loadAttributes(u"service", "service", attributes) || !attributes.get(hostKey, host) ||
        host.isEmpty())
        host.assign(publicHost);

    FString url("https://");
    url.append(toWireText(host));
    url.append(path);
    return url;
}
} // namespace

FString makeApiUrl(const char* path)
{
    return makeUrl("API Host", kPublicApiHost, path);
}

FString makeWebUrl(const char* path)
{
    return makeUrl("Web Host", kPublicWebHost, path);
}

FString getCertificateFile()
{
    FString text(gController->getAppPath());
    text.append(u"/Resources/cacert.pem");
    FNPath path(text.text16(), FPath::kFile);
    return toWirePath(path);
}
