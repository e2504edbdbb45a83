#include "storage/url/furlhandler.h"

#include "storage/stream/fstream.h"

DEFINE_ABSTRACT_CLASS(FUrlHandler, CmObject)

FUrlHandler::FUrlHandler(FUrl& handledUrl) : url(handledUrl) {}

FUrlHandler::~FUrlHandler()
{
    if (stream)
        stream->release();
}
