#include "storage/stream/fcompressionengine.h"

DEFINE_ABSTRACT_CLASS(FCompressionEngine, CmObject)

bool FCompressionEngine::isFormat(const FUID& format)
{
    FUID own;
    getFormat(own);
    return own == format;
}
