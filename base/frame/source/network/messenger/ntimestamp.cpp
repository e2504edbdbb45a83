#include "network/messenger/ntimestamp.h"

#include "foundation/object/iptr.h"
#include "network/messenger/netmessagenames.h"
#include "storage/attribute/fattributes.h"

DEFINE_CLASS(NTimeStamp, CmObject)

bool NTimeStamp::externalize(FArchive& archive) const
{
    const auto attributes = adopt(new FAttributes);
    // The archive knows by their addresses what it wrote.
    archive.forgetLater(IPtr<FAttributes>(attributes).take());
    return storeAttributes(*attributes) && attributes->externalize(archive);
}

bool NTimeStamp::internalize(FArchive& archive)
{
    FAttributes attributes;
    return attributes.internalize(archive) && restoreAttributes(attributes);
}

bool NTimeStamp::storeAttributes(FAttributes& attributes) const
{
    return attributes.set(kNetStampValue, microseconds);
}

bool NTimeStamp::restoreAttributes(FAttributes& attributes)
{
    return attributes.get(kNetStampValue, microseconds);
}
