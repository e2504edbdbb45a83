#include "storage/stream/fcompressionengine.h"

#include <limits>

DEFINE_ABSTRACT_CLASS(FCompressionEngine, CmObject)

int64 FCompressionEngine::getMaxUncompressedSize(int64)
{
    return std::numeric_limits<int64>::max();
}

bool FCompressionEngine::isFormat(const FUID& format)
{
    FUID own;
    getFormat(own);
    return own == format;
}
