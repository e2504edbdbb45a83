#include "foundation/text/cmstring.h"
#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"

namespace
{
constexpr char kTextKey[] = "s";
} // namespace

bool FString::externalize(FArchive& archive) const
{
    return store(archive.getStream());
}

bool FString::internalize(FArchive& archive)
{
    return load(archive.getStream());
}

bool CmString::externalize(FArchive& archive) const
{
    return FString::externalize(archive);
}

bool CmString::internalize(FArchive& archive)
{
    return FString::internalize(archive);
}

bool CmString::storeAttributes(FAttributes& attributes) const
{
    return attributes.set(kTextKey, *this);
}

bool CmString::restoreAttributes(FAttributes& attributes)
{
    return attributes.get(kTextKey, *this);
}
