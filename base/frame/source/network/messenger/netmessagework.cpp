#include "network/messenger/netmessagework.h"

#include "network/messenger/imicrosecondstimer.h"
#include "network/messenger/netmessageform.h"
#include "network/messenger/nmessenger.h"
#include "storage/stream/fmemorystream.h"
#include "storage/url/furlhandler.h"

NetMessageWork::NetMessageWork(NMessenger& owner, const FUrl& target, const char* receiverName,
                               const IPtr<NMessage>& messageCopy)
    : messenger(owner),
      url(adopt(new FUrl(target))),
      receiver(receiverName),
      message(messageCopy)
{
    // Made here, since `cancelWork` needs it on another thread.
    url->makeHandler();
}

void NetMessageWork::performThreadWork(void*)
{
    if (IMicrosecondsTimer* timer = messenger.getTimer())
        message->setSentTime(timer->getMicroseconds());
    const auto bytes = adopt(new FMemoryStream);
    if (!writeNetMessage(*bytes, receiver.text8(), *message) || bytes->getSize() > kMaxNetMessage)
        return;
    if (!send(*bytes) && !cancelled)
        messenger.removeReceiver(url->getHost().text8(), static_cast<uint16>(url->getPort()));
}

/// False where the connection fails.
bool NetMessageWork::send(FStream& bytes)
{
    FUrlHandler* handler = url->getHandler();
    if (!handler || !handler->open())
        return false;
    const bool isSent = handler->getStream()->copyFrom(bytes);
    handler->close();
    return isSent;
}

void NetMessageWork::cancelWork()
{
    cancelled = true;
    if (FUrlHandler* handler = url->getHandler())
        handler->cancel();
}
