#include "network/messenger/netmessagework.h"

#include "network/messenger/imicrosecondstimer.h"
#include "network/messenger/netmessageform.h"
#include "network/messenger/nmessenger.h"
#include "storage/url/furlhandler.h"

NetMessageWork::NetMessageWork(NMessenger& owner, const FUrl& target, const IPtr<FMemoryStream>& messageBytes)
    : messenger(owner),
      url(adopt(new FUrl(target))),
      bytes(messageBytes)
{
    // Made here, since `cancelWork` needs it on another thread.
    url->makeHandler();
}

void NetMessageWork::performThreadWork(void*)
{
    IMicrosecondsTimer* timer = messenger.getTimer();
    const IPtr<FMemoryStream> toSend = timer ? withSentTime(*bytes, timer->getMicroseconds()) : bytes;
    if (toSend && !send(*toSend) && !cancelled)
        messenger.removeReceiver(url->getHost().text8(), static_cast<uint16>(url->getPort()));
}

/// False where the connection fails.
bool NetMessageWork::send(const FMemoryStream& toSend)
{
    FUrlHandler* handler = url->getHandler();
    if (!handler || !handler->open())
        return false;
    const int64 size = toSend.getSize();
    const bool isSent = handler->getStream()->writeRaw(toSend.getData(), size) == size;
    handler->close();
    return isSent;
}

void NetMessageWork::cancelWork()
{
    cancelled = true;
    if (FUrlHandler* handler = url->getHandler())
        handler->cancel();
}
