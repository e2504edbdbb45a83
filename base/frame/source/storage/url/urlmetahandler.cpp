#include "storage/url/urlmetahandler.h"

UrlMetaHandler::UrlMetaHandler(const FString& handledProtocol, uint16 port, FUrl::HandlerFactory maker)
    : protocol(handledProtocol),
      defaultPort(port),
      factory(maker)
{
}
