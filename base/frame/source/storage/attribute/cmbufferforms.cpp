#include "containers/value/cmbuffer.h"
#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"

static constexpr const char* kDataKey = "Data";
static constexpr const char* kFillSizeKey = "FillSize";

bool CmBuffer::externalize(FArchive& archive) const
{
    return writeToStream(archive.getStream());
}

bool CmBuffer::internalize(FArchive& archive)
{
    return readFromStream(archive.getStream());
}

bool CmBuffer::storeAttributes(FAttributes& attributes) const
{
    return attributes.setBinary(kDataKey, buffer, memSize) && attributes.set(kFillSizeKey, fillSize);
}

bool CmBuffer::restoreAttributes(FAttributes& attributes)
{
    if (!attributes.containsAttribute(kDataKey) || !setSize(attributes.getBinarySize(kDataKey)))
        return false;
    if (memSize > 0 && !attributes.getBinary(kDataKey, buffer, memSize))
        return false;
    fillSize = memSize;
    uint32 filled = 0;
    if (attributes.get(kFillSizeKey, filled) && filled < memSize)
        fillSize = filled;
    return true;
}
