#pragma once

#include "foundation/object/iptr.h"
#include "foundation/thread/fthread.h"
#include "network/messenger/nmessagestream.h"
#include "network/socket/nserver.h"
#include "network/socket/nsocketpoll.h"

#include <atomic>
#include <vector>

class IMicrosecondsTimer;

/// Hands out connections that collect their message. As NServer.
class NMessageServer : public NServer
{
    DECLARE_TYPE(NMessageServer, NServer)

    using NServer::NServer;

protected:
    NStream* makeStream(std::unique_ptr<NSocket> connection) override;
};

/// Takes the messages that other programs send, and posts each to the receiver that it names.
///
/// The connections are read side by side on this one thread, and each is handled when its message is whole. What
/// others can make us hold is limited: see the constants. The owner calls `open`, `run` and `end`; the rest belongs
/// to the thread itself.
class NMessageRecvThread : public FThread
{
public:
    /// Connections whose messages are under way. Others wait in the system's queue.
    static constexpr size_t kMaxConnections = 64;
    /// While as many messages wait for their receivers in the whole program, no more are taken.
    static constexpr int kMaxWaitingMessages = 64;
    /// Milliseconds that a connection may bring nothing before it is dropped.
    static constexpr int kStallLimit = 30000;

    /// The clock is borrowed and may be null.
    explicit NMessageRecvThread(uint16 port, const std::atomic<IMicrosecondsTimer*>& messageTimer);
    ~NMessageRecvThread() override;

    /// Begins to listen; false where the port can't be had.
    /// A connection that goes before it is taken must not hold up the others: the server never waits by itself.
    bool open() { return server.open(0); }
    /// The port in use.
    uint16 getPort() const { return server.getLocalPort(); }
    void setStallLimit(int milliseconds) { stallLimit = milliseconds; }
    int entry() override;
    /// Stops and waits for the thread.
    void end();

    /// Reads a message and posts it. False where the stream has none.
    bool handleMessageWork(NStream* stream);

private:
    static bool isProgramBehind();
    int waitLimit() const;
    bool waitForWork();
    void acceptConnection();
    void collectMessages();
    bool isDone(NMessageStream& connection);

    NMessageServer server;
    const std::atomic<IMicrosecondsTimer*>& timer;
    int stallLimit = kStallLimit;
    NSocketPoll poll;
    std::vector<IPtr<NMessageStream>> connections;
};
