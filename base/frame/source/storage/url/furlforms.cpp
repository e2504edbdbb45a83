#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/optionaltext.h"
#include "storage/stream/fstream.h"
#include "storage/url/furl.h"

// The file forms of URLs.

bool FUrl::storeAttributes(FAttributes& attributes) const
{
    attributes.set("Protocol", protocol);
    attributes.set("Host", host);
    attributes.set("Port", port);
    OptionalText::store(attributes, "File", file);
    OptionalText::store(attributes, "User", user);
    OptionalText::store(attributes, "Password", password);
    return true;
}

bool FUrl::restoreAttributes(FAttributes& attributes)
{
    dropHandler();
    OptionalText::restore(attributes, "Protocol", protocol);
    OptionalText::restore(attributes, "Host", host);
    if (!attributes.get("Port", port))
        port = 0;
    OptionalText::restore(attributes, "File", file);
    OptionalText::restore(attributes, "User", user);
    OptionalText::restore(attributes, "Password", password);
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
