#include "foundation/text/cmstring.h"

#include "foundation/object/fastcast.h"
#include "foundation/object/stringhash.h"

#include <cstring>

DEFINE_CLASS(CmString, CmObject)

bool CmString::isEqual(const CmObject* other) const
{
    const CmString* text = FCastLikely(CmString, other);
    if (!text)
        return CmObject::isEqual(other);
    if (!isWide || !text->isWide || len != text->len)
        return FString::compare(*text) == 0;
    return len == 0 || memcmp(buffer, text->buffer, len * sizeof(char16)) == 0;
}

int CmString::compare(const CmObject* other) const
{
    if (const CmString* text = FCastLikely(CmString, other))
        return FString::compare(*text);
    return CmObject::compare(other);
}

unsigned CmString::hash(unsigned size) const
{
    return isWide ? hashString16(static_cast<const char16*>(buffer), len, size)
                  : hashString8(static_cast<const char*>(buffer), len, size);
}
