#include "network/socket/nbroadcaststream.h"
#include "networkfixture.h"

#include <gtest/gtest.h>

#include <string>

namespace
{
std::string patternOf(size_t size)
{
    std::string result(size, 0);
    for (size_t i = 0; i < size; i++)
        result[i] = static_cast<char>(i * 31 + i / 251);
    return result;
}
} // namespace

TEST(NStream, MovesTypedValuesAndTellsTheOtherSide)
{
    Connection connection;
    ASSERT_TRUE(connection.isUp());
    EXPECT_EQ(connection.client.getRemotePort(), connection.server.getLocalPort());
    EXPECT_EQ(connection.accepted->getRemoteAddress(), kLoopbackAddress);
    uint16 port = 0;
    EXPECT_TRUE(connection.client.getSocket()->getLocal(nullptr, &port));
    EXPECT_EQ(connection.accepted->getRemotePort(), port);

    ASSERT_TRUE(connection.client.writeInt32(0x01020304) && connection.client.writeStr8("text"));
    EXPECT_TRUE(connection.client.close());
    EXPECT_FALSE(connection.client.close());

    NStream& reader = *connection.accepted;
    int32 number = 0;
    EXPECT_TRUE(reader.readInt32(number));
    EXPECT_EQ(number, 0x01020304);
    EXPECT_EQ(reader.tell(), 4);
    EXPECT_EQ(reader.seek(4, kSeekStart), 4);
    EXPECT_EQ(reader.seek(0, kSeekStart), -1) << "there is no way back";
    const std::unique_ptr<char[]> text(reader.readStr8());
    ASSERT_TRUE(text);
    EXPECT_STREQ(text.get(), "text");
    EXPECT_FALSE(reader.readInt32(number));
    EXPECT_TRUE(reader.verify()) << "the end is orderly";
}

TEST(NStream, MovesMoreThanTheBuffersHold)
{
    Connection connection;
    ASSERT_TRUE(connection.isUp());
    const std::string sent = patternOf(8 * 1024 * 1024 + 7);
    Background writer(
        [&]
        {
            connection.client.writeRaw(sent.data(), static_cast<int64>(sent.size()));
            connection.client.close();
        });
    std::string received(sent.size(), 0);
    // In pieces below and above what is read ahead.
    size_t place = 0;
    for (size_t piece = 1; place < received.size(); piece = piece % 50000 + 777)
    {
        const size_t wanted = std::min(piece, received.size() - place);
        ASSERT_EQ(connection.accepted->readRaw(&received[place], static_cast<int64>(wanted)),
                  static_cast<int64>(wanted));
        place += wanted;
    }
    EXPECT_TRUE(received == sent);
    char more = 0;
    EXPECT_EQ(connection.accepted->readRaw(&more, 1), 0);
}

TEST(NStream, CancelEndsAReadUntilTheStreamIsClosed)
{
    Connection connection;
    ASSERT_TRUE(connection.isUp());
    char byte = 0;
    {
        Background canceller([&] { connection.client.cancel(); });
        EXPECT_EQ(connection.client.readRaw(&byte, 1), 0);
    }
    EXPECT_FALSE(connection.client.verify());
    EXPECT_EQ(connection.client.writeRaw(&byte, 1), 0);
    const uint16 port = connection.server.getLocalPort();
    EXPECT_FALSE(connection.client.open("127.0.0.1", port, 5)) << "it stays cancelled";
    connection.client.close();
    EXPECT_TRUE(connection.client.open("127.0.0.1", port, 5));
}

TEST(NStream, AStalledTransferFails)
{
    Connection connection;
    ASSERT_TRUE(connection.isUp());
    connection.accepted->setStallLimit(10);
    ASSERT_TRUE(connection.client.writeInt16(7));
    int32 number = 1;
    EXPECT_FALSE(connection.accepted->readInt32(number));
    EXPECT_EQ(number, 0);
    EXPECT_FALSE(connection.accepted->verify());

    connection.client.setStallLimit(10);
    const std::string block(1 << 20, 'x');
    int64 written = 1;
    for (int i = 0; i < 1000 && written > 0; i++)
        written = connection.client.writeRaw(block.data(), static_cast<int64>(block.size()));
    EXPECT_FALSE(connection.client.verify()) << "nobody reads";
}

TEST(NStream, OpenFailsWhereNobodyIs)
{
    uint16 port = 0;
    {
        Connection connection;
        ASSERT_TRUE(connection.isUp());
        port = connection.server.getLocalPort();
    }
    NStream stream;
    EXPECT_FALSE(stream.open("127.0.0.1", port, 5));
    EXPECT_FALSE(stream.open("", 80, 5));
    EXPECT_FALSE(stream.isOpen());
    EXPECT_FALSE(stream.close());
    EXPECT_FALSE(stream.writeInt32(1));
}

TEST(NServer, StopsAndWaitsNoLongerThanItShall)
{
    NServer server(0, 4);
    EXPECT_FALSE(server.setAddress("nowhere"));
    ASSERT_TRUE(server.setAddress("127.0.0.1"));
    EXPECT_EQ(server.waitForConnection(), nullptr) << "not open";
    ASSERT_TRUE(server.open(10));
    EXPECT_NE(server.getLocalPort(), 0);
    FString address;
    server.getIPAddress(address);
    EXPECT_STREQ(address.text8(), "127.0.0.1");
    EXPECT_EQ(server.waitForConnection(), nullptr) << "nobody comes";

    ASSERT_TRUE(server.open());
    Background stopper([&] { server.stop(); });
    EXPECT_EQ(server.waitForConnection(), nullptr);
    EXPECT_TRUE(server.isStopped());
    stopper.join();
    ASSERT_TRUE(server.open()) << "opening forgets the stop";
    NStream client;
    ASSERT_TRUE(client.open("localhost", server.getLocalPort(), 5));
    EXPECT_TRUE(adopt(server.waitForConnection()));
}

TEST(NBroadcastStream, ReceivesFromEveryoneAndSharesItsPort)
{
    NSocket probe(NSocket::kDatagram);
    uint16 port = 0;
    ASSERT_TRUE(probe.bind(0) && probe.getLocal(nullptr, &port));

    NBroadcastStream receiver(true);
    ASSERT_TRUE(receiver.open(port)) << "others may be bound to it";
    EXPECT_EQ(receiver.writeRaw("x", 1), -1) << "it only receives";
    probe.endSocket();

    NUDPStream sender;
    ASSERT_TRUE(sender.open("127.0.0.1", port, 5));
    const std::string tooLong(70000, 'x');
    EXPECT_EQ(sender.writeRaw(tooLong.data(), 70000), -1);
    ASSERT_EQ(sender.writeRaw("datagram", 8), 8);
    ASSERT_EQ(sender.writeRaw("", 0), 0);
    ASSERT_EQ(sender.writeRaw("next", 4), 4);

    char text[16] = {};
    EXPECT_EQ(receiver.readRaw(text, 4), 4) << "cut to what is asked for";
    EXPECT_STREQ(text, "data");
    EXPECT_EQ(receiver.getRemoteAddress(), kLoopbackAddress);
    uint16 senderPort = 0;
    EXPECT_TRUE(sender.getSocket()->getLocal(nullptr, &senderPort));
    EXPECT_EQ(receiver.getRemotePort(), senderPort);
    EXPECT_EQ(receiver.readRaw(text, sizeof text), 0) << "an empty datagram";
    EXPECT_EQ(receiver.readRaw(text, sizeof text), 4);
    EXPECT_STREQ(text, "next") << "the rest of the first one is gone";
}
