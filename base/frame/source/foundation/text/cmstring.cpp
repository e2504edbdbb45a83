#include "foundation/text/cmstring.h"

#include "foundation/object/fastcast.h"
#include "foundation/object/stringhash.h"
#include "foundation/object/wordat.h"

#include <cstring>

DEFINE_CLASS(CmString, CmObject)

namespace
{
/// Keys of tables have mostly some ten characters, for which a call would take longer than the comparison.
bool areSame(const void* left, const void* right, size_t bytes)
{
    if (bytes < 16 || bytes > 32)
        return bytes == 0 || memcmp(left, right, bytes) == 0;
    const char* a = static_cast<const char*>(left);
    const char* b = static_cast<const char*>(right);
    const size_t end = bytes - 16;
    return ((wordAt(a) ^ wordAt(b)) | (wordAt(a + 8) ^ wordAt(b + 8)) | (wordAt(a + end) ^ wordAt(b + end)) |
            (wordAt(a + end + 8) ^ wordAt(b + end + 8))) == 0;
}
} // namespace

bool CmString::isEqual(const CmObject* other) const
{
    const CmString* text = FCastLikely(CmString, other);
    if (!text)
        return CmObject::isEqual(other);
    if (!isWide || !text->isWide || len != text->len)
        return FString::compare(*text) == 0;
    return areSame(buffer, text->buffer, len * sizeof(char16));
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
