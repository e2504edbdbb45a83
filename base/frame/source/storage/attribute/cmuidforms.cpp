#include "foundation/object/cmuid.h"
#include "foundation/text/fstring.h"
#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"

namespace
{
constexpr const char* kIdentifier = "GUID";
constexpr int kDigitsSize = 33;
} // namespace

void CmUID::toFString(String& text) const
{
    char digits[kDigitsSize];
    FUID::toString(digits);
    text.assign(digits);
}

bool CmUID::externalize(FArchive& archive) const
{
    FString digits;
    toFString(digits);
    digits.externalize(archive);
    return true;
}

bool CmUID::internalize(FArchive& archive)
{
    FString digits;
    digits.internalize(archive);
    return fromLongString(digits.text8());
}

bool CmUID::storeAttributes(FAttributes& attributes) const
{
    char digits[kDigitsSize];
    FUID::toString(digits);
    attributes.setString8(kIdentifier, digits);
    return true;
}

bool CmUID::restoreAttributes(FAttributes& attributes)
{
    String digits;
    return attributes.get(kIdentifier, digits) && FUID::fromString(digits.text8());
}
