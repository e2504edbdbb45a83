#include "network/socket/nsocket.h"
#include "network/socket/nsocketpoll.h"
#include "networkfixture.h"

#include <gtest/gtest.h>

#include <cstring>
#include <string>
#include <vector>

namespace
{
/// A listening socket of the loopback interface and its port.
struct Listener
{
    explicit Listener(int backlog)
    {
        socket.setBindAddress(kLoopbackAddress);
        isUp = socket.bind(0) && socket.listen(backlog) && socket.getLocal(nullptr, &port);
    }

    NSocket socket{NSocket::kStream};
    uint16 port = 0;
    bool isUp;
};

/// Fills the listener's backlog, so that a further connection stays in the air. Null where the system takes them all.
std::vector<std::unique_ptr<NSocket>> fillBacklog(const Listener& listener)
{
    std::vector<std::unique_ptr<NSocket>> waiting;
    for (int i = 0; i < 64; i++)
    {
        auto socket = std::make_unique<NSocket>(NSocket::kStream);
        if (!socket->connect(kLoopbackAddress, listener.port, 200))
            return waiting;
        waiting.push_back(std::move(socket));
    }
    return {};
}
} // namespace

TEST(NSocket, TellsStateAndBothEndsOfAConnection)
{
    Listener listener(4);
    ASSERT_TRUE(listener.isUp);
    EXPECT_EQ(listener.socket.getState(), NSocket::kListening);

    NSocket client(NSocket::kStream);
    EXPECT_FALSE(client.isCreated());
    EXPECT_FALSE(client.getPeer(nullptr, nullptr));
    ASSERT_TRUE(client.connect(kLoopbackAddress, listener.port, 5000));
    EXPECT_EQ(client.getState(), NSocket::kConnected);

    uint8 address[NAddress::kSize] = {};
    int size = sizeof address;
    const auto accepted = listener.socket.accept(address, &size, true);
    ASSERT_TRUE(accepted);
    EXPECT_TRUE(accepted->nonBlockingModeSet());
    EXPECT_EQ(size, NAddress::kSize);
    EXPECT_EQ(memcmp(address, kLoopbackAddress.bytes, sizeof address), 0);

    uint16 clientPort = 0, seenPort = 0, peerPort = 0;
    NAddress peer;
    EXPECT_TRUE(client.getLocal(nullptr, &clientPort));
    EXPECT_TRUE(accepted->getPeer(nullptr, &seenPort));
    EXPECT_EQ(clientPort, seenPort);
    EXPECT_TRUE(client.getPeer(peer.bytes, &peerPort));
    EXPECT_EQ(peerPort, listener.port);
    EXPECT_EQ(peer, kLoopbackAddress);

    client.endSocket();
    EXPECT_FALSE(client.isCreated());
    char byte = 0;
    EXPECT_TRUE(accepted->isPending(kPendingRead, 5000)) << "the end can be read";
    EXPECT_EQ(accepted->receiveData(&byte, 1), 0);
}

TEST(NSocket, DoesNotWaitInNonBlockingMode)
{
    Listener listener(4);
    ASSERT_TRUE(listener.isUp);
    listener.socket.setNonBlockingMode(true);
    EXPECT_FALSE(listener.socket.accept(nullptr, nullptr, false));

    NSocket client(NSocket::kStream);
    ASSERT_TRUE(client.connect(kLoopbackAddress, listener.port, 5000));
    ASSERT_TRUE(listener.socket.isPending(kPendingRead, 5000));
    const auto accepted = listener.socket.accept(nullptr, nullptr, true);
    ASSERT_TRUE(accepted);
    char byte = 0;
    EXPECT_EQ(accepted->receiveData(&byte, 1), kSocketWouldBlock);
    EXPECT_FALSE(accepted->isPending(kPendingRead, 0));

    // What nobody reads fills the buffers some time.
    client.setNonBlockingMode(true);
    const std::string block(65536, 'x');
    int result = 0;
    for (int i = 0; i < 10000 && result != kSocketWouldBlock; i++)
        result = client.sendData(block.data(), static_cast<int>(block.size()));
    EXPECT_EQ(result, kSocketWouldBlock);
    EXPECT_FALSE(client.isPending(kPendingWrite, 0));
}

TEST(NSocket, StopEndsEveryKindOfWaitAndStaysUntilTheSocketEnds)
{
    Listener listener(4);
    ASSERT_TRUE(listener.isUp);
    {
        Background stopper([&] { listener.socket.stopOperation(); });
        EXPECT_FALSE(listener.socket.accept(nullptr, nullptr, false));
    }
    EXPECT_TRUE(listener.socket.isStopped());
    EXPECT_FALSE(listener.socket.isPending(kPendingRead, -1)) << "a later wait ends at once";
    listener.socket.endSocket();
    EXPECT_FALSE(listener.socket.isStopped());

    NSocket datagrams(NSocket::kDatagram);
    datagrams.setBindAddress(kLoopbackAddress);
    ASSERT_TRUE(datagrams.bind(0));
    NAddress sender;
    uint16 port = 0;
    char byte = 0;
    Background stopper([&] { datagrams.stopOperation(); });
    EXPECT_EQ(datagrams.receiveDataFrom(sender, port, &byte, 1), kSocketFailed);
}

TEST(NSocket, ConnectEndsWithItsLimitAndByAStop)
{
    Listener listener(0);
    ASSERT_TRUE(listener.isUp);
    const auto waiting = fillBacklog(listener);
    if (waiting.empty())
        GTEST_SKIP() << "this system lets every connection wait, so none stays in the air";

    NSocket late(NSocket::kStream);
    EXPECT_FALSE(late.connect(kLoopbackAddress, listener.port, 10));
    EXPECT_FALSE(late.isCreated());

    Background stopper([&] { late.stopOperation(); });
    EXPECT_FALSE(late.connect(kLoopbackAddress, listener.port, -1));
    stopper.join();
    EXPECT_FALSE(late.connect(kLoopbackAddress, listener.port, -1)) << "it stays stopped";
}

TEST(NSocket, PortsAreRefusedAndTakenAgain)
{
    uint16 port = 0;
    {
        Connection connection;
        ASSERT_TRUE(connection.isUp());
        port = connection.server.getLocalPort();
        NSocket second(NSocket::kStream);
        second.setBindAddress(kLoopbackAddress);
        EXPECT_FALSE(second.bind(port) && second.listen(1)) << "somebody listens there";
        connection.accepted->close();
    }
    NSocket nobody(NSocket::kStream);
    EXPECT_FALSE(nobody.connect(kLoopbackAddress, port, 5000));
    NServer again(port, 1);
    ASSERT_TRUE(again.setAddress("127.0.0.1"));
    EXPECT_TRUE(again.open()) << "a port that was used a moment ago";
}

TEST(NSocket, TakesOptions)
{
    NSocket socket(NSocket::kStream);
    EXPECT_EQ(socket.getReceiveBufferSize(), 0u) << "there is no socket yet";
    EXPECT_TRUE(socket.setTcpNoDelay(true));
    EXPECT_TRUE(socket.setReceiveBufferSize(16384));
    EXPECT_TRUE(socket.setSendBufferSize(32768));
    EXPECT_GE(socket.getReceiveBufferSize(), 16384u);
    EXPECT_GE(socket.getSendBufferSize(), 32768u);
}

TEST(NSocketPoll, TellsWhichSocketIsReady)
{
    Connection first, second;
    ASSERT_TRUE(first.isUp() && second.isUp());
    NSocketPoll poll;
    const int firstIndex = poll.add(*first.accepted->getSocket(), kPendingRead);
    const int secondIndex = poll.add(*second.accepted->getSocket(), kPendingRead);
    EXPECT_FALSE(poll.wait(0));

    ASSERT_TRUE(second.client.writeInt32(1));
    ASSERT_TRUE(poll.wait(5000));
    EXPECT_FALSE(poll.isReady(firstIndex));
    EXPECT_TRUE(poll.isReady(secondIndex));

    first.accepted->cancel();
    EXPECT_FALSE(poll.wait(-1)) << "one of them was stopped";
}
