#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/stream/ffiletype.h"
#include "storage/stream/fstream.h"

// The file forms of file types.

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

bool FFileType::storeAttributes(FAttributes& attributes) const
{
    if (macType != 0)
        attributes.set("MacType", macType);
    setUnlessEmpty(attributes, "DosType", dosType);
    setUnlessEmpty(attributes, "UnixType", unixType);
    setUnlessEmpty(attributes, "MimeType", mimeType);
    setUnlessEmpty(attributes, "UTI", uti);
    setUnlessEmpty(attributes, "Name", name);
    return true;
}

bool FFileType::restoreAttributes(FAttributes& attributes)
{
    if (!attributes.get("MacType", macType))
        macType = 0;
    getOrEmpty(attributes, "DosType", dosType);
    getOrEmpty(attributes, "UnixType", unixType);
    getOrEmpty(attributes, "MimeType", mimeType);
    getOrEmpty(attributes, "UTI", uti);
    getOrEmpty(attributes, "Name", name);
    return true;
}

bool FFileType::externalize(FArchive& archive) const
{
    bool isWritten = archive.getStream().writeInt32(macType);
    for (const FString* text : {&dosType, &unixType, &mimeType, &uti, &name})
        isWritten = isWritten && text->externalize(archive);
    return isWritten;
}

bool FFileType::internalize(FArchive& archive)
{
    bool isRead = archive.getStream().readInt32(macType);
    for (FString* text : {&dosType, &unixType, &mimeType, &uti, &name})
        isRead = isRead && text->internalize(archive);
    return isRead;
}
