#include "foundation/text/cmstring.h"

#include "foundation/object/fastcast.h"
#include "foundation/object/stringhash.h"
#include "foundation/object/wordat.h"

#include <cstring>

DEFINE_CLASS(CmString, CmObject)

namespace
{
/// 0 where 16 bytes are the same.
uint64 difference16(const char* a, const char* b)
{
    return (wordAt(a) ^ wordAt(b)) | (wordAt(a + 8) ^ wordAt(b + 8));
}

/// Keys of tables have mostly some ten characters, for which a call would take longer than the comparison: the first 16
/// bytes and the last 16, which may overlap. Keys differ anywhere, so that a branch between them would be guessed wrong.
bool areSame(const char* a, const char* b, size_t bytes)
{
    if (bytes < 16 || bytes > 32)
        return bytes == 0 || memcmp(a, b, bytes) == 0;
    return (difference16(a, b) | difference16(a + bytes - 16, b + bytes - 16)) == 0;
}
} // namespace

bool CmString::isEqual(const CmObject* other) const
{
    const CmString* text = FCastLikely(CmString, other);
    if (!text)
        return CmObject::isEqual(other);
    if (!isWide || !text->isWide || len != text->len)
        return FString::compare(*text) == 0;
    return areSame(static_cast<const char*>(buffer), static_cast<const char*>(text->buffer),
                   len * sizeof(char16));
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
