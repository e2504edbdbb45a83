#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/optionaltext.h"
#include "storage/stream/ffiletype.h"
#include "storage/stream/fstream.h"

// The file forms of file types.

bool FFileType::storeAttributes(FAttributes& attributes) const
{
    if (macType != 0)
        attributes.set("MacType", macType);
    OptionalText::store(attributes, "DosType", dosType);
    OptionalText::store(attributes, "UnixType", unixType);
    OptionalText::store(attributes, "MimeType", mimeType);
    OptionalText::store(attributes, "UTI", uti);
    OptionalText::store(attributes, "Name", name);
    return true;
}

bool FFileType::restoreAttributes(FAttributes& attributes)
{
    if (!attributes.get("MacType", macType))
        macType = 0;
    OptionalText::restore(attributes, "DosType", dosType);
    OptionalText::restore(attributes, "UnixType", unixType);
    OptionalText::restore(attributes, "MimeType", mimeType);
    OptionalText::restore(attributes, "UTI", uti);
    OptionalText::restore(attributes, "Name", name);
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
