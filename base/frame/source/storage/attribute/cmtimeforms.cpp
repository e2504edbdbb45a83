#include "containers/value/cmtime.h"
#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/stream/fstream.h"

static constexpr const char* kTimeKey = "seconds";

bool CmTime::externalize(FArchive& archive) const
{
    return archive.getStream().writeInt32u(seconds);
}

bool CmTime::internalize(FArchive& archive)
{
    return archive.getStream().readInt32u(seconds);
}

bool CmTime::storeAttributes(FAttributes& attributes) const
{
    return attributes.set(kTimeKey, seconds);
}

bool CmTime::restoreAttributes(FAttributes& attributes)
{
    return attributes.get(kTimeKey, seconds);
}
