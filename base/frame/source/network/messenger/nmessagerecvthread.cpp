#include "network/messenger/nmessagerecvthread.h"

#include "foundation/message/fmessenger.h"
#include "foundation/text/fstring.h"
#include "network/messenger/imicrosecondstimer.h"
#include "network/messenger/netmessageform.h"
#include "network/messenger/netmessagenames.h"

namespace
{
constexpr int kBacklog = 64;
/// Milliseconds between two looks for connections that stall, and for the program to come after.
constexpr int kStallCheck = 500;
constexpr int kBehindCheck = 20;
} // namespace

NStream* NMessageServer::makeStream(std::unique_ptr<NSocket> connection)
{
    return new NMessageStream(std::move(connection));
}

NMessageRecvThread::NMessageRecvThread(uint16 port, const std::atomic<IMicrosecondsTimer*>& messageTimer)
    : FThread("Network Message Receiver"),
      server(port, kBacklog),
      timer(messageTimer)
{
}

NMessageRecvThread::~NMessageRecvThread()
{
    end();
}

void NMessageRecvThread::end()
{
    server.stop();
    waitDead(-1);
    connections.clear();
    server.close();
}

int NMessageRecvThread::entry()
{
    while (!server.isStopped())
    {
        if (isProgramBehind())
            server.getSocket().waitForStop(kBehindCheck);
        else if (waitForWork())
            acceptConnection();
        collectMessages();
    }
    return 0;
}

bool NMessageRecvThread::isProgramBehind()
{
    FMessenger* messenger = gMessenger;
    return messenger && messenger->countWaiting() >= kMaxWaitingMessages;
}

/// Waits until something comes. Whether it is a connection.
bool NMessageRecvThread::waitForWork()
{
    poll.clear();
    for (const auto& connection : connections)
        poll.add(*connection->getSocket(), kPendingRead);
    if (connections.size() >= kMaxConnections)
    {
        poll.addCanceller(server.getSocket());
        poll.wait(kStallCheck);
        return false;
    }
    const int serverIndex = poll.add(server.getSocket(), kPendingRead);
    return poll.wait(connections.empty() ? -1 : kStallCheck) && poll.isReady(serverIndex);
}

void NMessageRecvThread::acceptConnection()
{
    auto connection = adopt(static_cast<NMessageStream*>(server.waitForConnection()));
    if (connection)
        connections.push_back(connection);
    else
        // The process has no room for another connection, which stays in the queue and would come back at once.
        server.getSocket().waitForStop(kBehindCheck);
}

void NMessageRecvThread::collectMessages()
{
    std::erase_if(connections, [this](const auto& connection) { return isDone(*connection); });
}

/// Whether the connection can go.
bool NMessageRecvThread::isDone(NMessageStream& connection)
{
    // Reading what came takes its time, and nobody waits for it any more.
    if (server.isStopped())
        return true;
    const NMessageStream::Progress progress = connection.collect();
    if (progress == NMessageStream::kGoesOn)
        return connection.isStalled(stallLimit);
    if (progress == NMessageStream::kComplete)
        handleMessageWork(&connection);
    return true;
}

bool NMessageRecvThread::handleMessageWork(NStream* stream)
{
    IMicrosecondsTimer* clock = timer;
    const int64 now = clock ? clock->getMicroseconds() : 0;
    FString receiver;
    const IPtr<NMessage> message = readNetMessage(*stream, receiver);
    if (!message || server.isStopped())
        return false;
    message->setRemote(stream->getRemoteAddress(), stream->getRemotePort());
    // A stamp of ours that the sender claims is none.
    message->remove(kNetReceivedStamp);
    if (clock)
        message->setReceivedTime(now);
    if (FMessenger* messenger = gMessenger)
        messenger->postMessage(receiver.text8(), IPtr<NMessage>(message).take(), false);
    return true;
}
