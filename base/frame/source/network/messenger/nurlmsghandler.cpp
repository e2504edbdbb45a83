#include "network/messenger/nurlmsghandler.h"

#include "network/messenger/netmessagenames.h"
#include "storage/url/furl.h"

namespace
{
constexpr int kConnectSeconds = 10;
constexpr int kStallLimit = 30000;
} // namespace

NUrlMsgHandler::NUrlMsgHandler(FUrl& handledUrl) : FUrlHandler(handledUrl), connection(adopt(new NStream))
{
    connection->setStallLimit(kStallLimit);
}

NUrlMsgHandler::~NUrlMsgHandler() = default;

bool NUrlMsgHandler::open()
{
    const auto port = static_cast<uint16>(url.getPort());
    stream = connection->open(url.getHost().text8(), port, kConnectSeconds) ? connection.get() : nullptr;
    return stream != nullptr;
}

bool NUrlMsgHandler::close()
{
    stream = nullptr;
    return connection->close();
}

void NUrlMsgHandler::cancel()
{
    connection->cancel();
}

FUrlHandler* createUrlMsgHandler(FUrl& url)
{
    return new NUrlMsgHandler(url);
}

void initNUrlMsgHandler()
{
    static const bool isDone = []
    {
        FUrl::registerHandler(FString(kNetMessageProtocol), kNetMessagePort, &createUrlMsgHandler);
        return true;
    }();
    static_cast<void>(isDone);
}
