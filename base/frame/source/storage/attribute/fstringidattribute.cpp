#include "storage/attribute/fstringidattribute.h"

#include "foundation/object/stringhash.h"
#include "foundation/text/fstring.h"
#include "storage/attribute/farchive.h"

DEFINE_CLASS(FStringIDAttribute, FAttributeValue)

bool FStringIDAttribute::isEqual(const CmObject* other) const
{
    if (const auto* entry = FCast(FStringIDAttribute, other))
        return name == entry->name;
    return CmObject::isEqual(other);
}

int FStringIDAttribute::compare(const CmObject* other) const
{
    if (const auto* entry = FCast(FStringIDAttribute, other))
        return compareKey(entry->getKey());
    return CmObject::compare(other);
}

unsigned FStringIDAttribute::hash(unsigned size) const
{
    return hashString8(getKey(), size);
}

bool FStringIDAttribute::externalize(FArchive& archive) const
{
    return FString::storeString8(archive.getStream(), getKey()) && FAttributeValue::externalize(archive);
}

bool FStringIDAttribute::internalize(FArchive& archive)
{
    FString key;
    if (!key.load(archive.getStream()))
        return false;
    name = key.text8();
    return FAttributeValue::internalize(archive);
}
