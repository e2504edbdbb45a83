#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/stream/fstream.h"
#include "storage/url/furl.h"

// The file forms of URLs.

namespace
{
void setUnlessEmpty(FAttributes& attributes, const char* key, const FString& text)
{
    if (!text.isEmpty())
        attributes.set(key, text);
}

void getOrEmpty(const FAttributes& attributes, const char* key, FString& text)
{
    if (!attributes.get(key, text))
        text.assign(u"");
}
} // namespace

bool FUrl::storeAttributes(FAttributes& attributes) const
{
    attributes.set("Protocol", protocol);
    attributes.set("Host", host);
    attributes.set("Port", port);
    setUnlessEmpty(attributes, "File", file);
    setUnlessEmpty(attributes, "User", user);
    setUnlessEmpty(attributes, "Password", password);
    return true;
}

bool FUrl::restoreAttributes(FAttributes& attributes)
{
    dropHandler();
    getOrEmpty(attributes, "Protocol", protocol);
    getOrEmpty(attributes, "Host", host);
    if (!attributes.get("Port", port))
        port = 0;
    getOrEmpty(attributes, "File", file);
    getOrEmpty(attributes, "User", user);
    getOrEmpty(attributes, "Password", password);
    updatePath();
    return true;
}

bool FUrl::externalize(FArchive& archive) const
{
    return protocol.externalize(archive) && host.externalize(archive) &&
           archive.getStream().writeInt16(port) && file.externalize(archive) && user.externalize(archive) &&
           password.externalize(archive);
}

bool FUrl::internalize(FArchive& archive)
{
    dropHandler();
    const bool isRead = protocol.internalize(archive) && host.internalize(archive) &&
                        archive.getStream().readInt16(port) && file.internalize(archive) &&
                        user.internalize(archive) && password.internalize(archive);
    updatePath();
    return isRead;
}
