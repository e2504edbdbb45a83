#include "storage/attribute/fintidattribute.h"

#include "storage/attribute/farchive.h"
#include "storage/stream/fstream.h"

DEFINE_CLASS(FIntIDAttribute, FAttributeValue)

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
