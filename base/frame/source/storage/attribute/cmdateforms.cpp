#include "containers/value/cmdate.h"
#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/stream/fstream.h"

static constexpr const char* kDateKey = "julian";

bool CmDate::externalize(FArchive& archive) const
{
    return archive.getStream().writeInt32u(julian);
}

bool CmDate::internalize(FArchive& archive)
{
    return archive.getStream().readInt32u(julian);
}

bool CmDate::storeAttributes(FAttributes& attributes) const
{
    return attributes.set(kDateKey, julian);
}

bool CmDate::restoreAttributes(FAttributes& attributes)
{
    return attributes.get(kDateKey, julian);
}
