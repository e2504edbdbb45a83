#include "network/messenger/nbroadcastrecvthread.h"

#include "containers/value/cmbuffer.h"
#include "network/messenger/imicrosecondstimer.h"
#include "network/messenger/nbroadcasttext.h"
#include "network/messenger/netmessagenames.h"
#include "network/messenger/nmessage.h"
#include "network/messenger/nmessenger.h"
#include "network/socket/naddresslookup.h"

namespace
{
/// One byte more than is taken, so that a longer datagram shows.
constexpr int kRoom = NBroadcastText::kMaxSize + 1;
/// Milliseconds of rest after an error that would come again at once.
constexpr int kRest = 20;

IPtr<NMessage> messageFor(const NBroadcastText& text, const NAddress& sender)
{
    auto message = adopt(new NMessage(text.isHello ? kNetAvailableMessage : kNetByeByeMessage));
    message->addString(kNetProgramName, text.program);
    message->addString(kNetProgramVersion, text.version);
    message->addString(kNetSender, text.host);
    message->setRemote(sender, text.port);
    return message;
}
} // namespace

NBroadcastRecvThread::NBroadcastRecvThread(NMessenger& owner, uint16 broadcastPort)
    : FThread("Network Broadcast Receiver"),
      messenger(owner),
      port(broadcastPort),
      stream(adopt(new NBroadcastStream(true)))
{
}

NBroadcastRecvThread::~NBroadcastRecvThread()
{
    end();
}

void NBroadcastRecvThread::end()
{
    stream->cancel();
    waitDead(-1);
    stream->close();
}

int NBroadcastRecvThread::entry()
{
    CmBuffer data(kRoom);
    while (!stream->isCancelled())
    {
        const int64 received = stream->readRaw(data.ptr(), kRoom);
        if (received < 0)
        {
            stream->getSocket()->waitForStop(kRest);
            continue;
        }
        IMicrosecondsTimer* timer = messenger.getTimer();
        data.setFillSize(static_cast<uint32>(received));
        handleBroadcastMessage(data, timer ? timer->getMicroseconds() : 0, stream->getRemoteAddress(),
                               stream->getRemotePort());
    }
    return 0;
}

// The port that a datagram came from says nothing: each is sent from another one.
void NBroadcastRecvThread::handleBroadcastMessage(CmBuffer& data, int64 timeStamp, const NAddress& sender,
                                                  [[maybe_unused]] uint16 senderPort)
{
    NBroadcastText text;
    if (!text.parse(data.ptr(), data.getFillSize()))
        return;
    const IPtr<NMessage> message = messageFor(text, sender);
    if (timeStamp != 0)
        message->setReceivedTime(timeStamp);
    if (text.port == messenger.getMsgPort() && NAddressLookup::isLocalAddress(sender))
        return;
    messenger.peerChanged(text.isHello, *message);
}
