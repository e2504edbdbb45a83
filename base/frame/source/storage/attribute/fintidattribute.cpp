#include "storage/attribute/fintidattribute.h"

#include "storage/attribute/farchive.h"
#include "storage/stream/fstream.h"

#include <charconv>
#include <cstring>

DEFINE_CLASS(FIntIDAttribute, FAttributeValue)

bool FIntIDAttribute::parseKey(const char* text, unsigned int& key)
{
    const char* end = text + strlen(text);
    const auto result = std::from_chars(text, end, key);
    return result.ec == std::errc() && result.ptr == end;
}

bool FIntIDAttribute::isEqual(const CmObject* other) const
{
    if (const auto* entry = FCast(FIntIDAttribute, other))
        return id == entry->id;
    return CmObject::isEqual(other);
}

int FIntIDAttribute::compare(const CmObject* other) const
{
    if (const auto* entry = FCast(FIntIDAttribute, other))
        return compareKey(entry->id);
    return CmObject::compare(other);
}

unsigned FIntIDAttribute::hash(unsigned size) const
{
    return id % size;
}

bool FIntIDAttribute::externalize(FArchive& archive) const
{
    return archive.getStream().writeInt32u(id) && FAttributeValue::externalize(archive);
}

bool FIntIDAttribute::internalize(FArchive& archive)
{
    return archive.getStream().readInt32u(id) && FAttributeValue::internalize(archive);
}
