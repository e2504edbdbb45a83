#include "foundation/text/cmstring.h"

#include "foundation/object/stringhash.h"

DEFINE_CLASS(CmString, CmObject)

bool CmString::isEqual(const CmObject* other) const
{
    if (const CmString* text = FCast(CmString, other))
        return FString::compare(*text) == 0;
    return CmObject::isEqual(other);
}

int CmString::compare(const CmObject* other) const
{
    if (const CmString* text = FCast(CmString, other))
        return FString::compare(*text);
    return CmObject::compare(other);
}

unsigned CmString::hash(unsigned size) const
{
    return isWide ? hashString16(ConstString::text16(), size) : hashString8(ConstString::text8(), size);
}
