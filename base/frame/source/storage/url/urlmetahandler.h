#pragma once

#include "foundation/object/cmobject.h"
#include "storage/url/furl.h"

/// How the handlers of one protocol are made. Immutable.
class UrlMetaHandler : public CmObject
{
    DECLARE_COPYABLE(UrlMetaHandler, CmObject)

    UrlMetaHandler(const FString& handledProtocol, uint16 port, FUrl::HandlerFactory maker);

    FString protocol;
    uint16 defaultPort;
    FUrl::HandlerFactory factory;
};
