#include "application/applicationsteps.h"
#include "foundation/thread/fworkclass.h"
#include "messengerfixture.h"
#include "network/messenger/netmessageform.h"
#include "network/messenger/nmessagerecvthread.h"
#include "network/messenger/nreceiver.h"
#include "network/messenger/nurlmsghandler.h"
#include "storage/stream/fmemorystream.h"
#include "storage/url/furl.h"
#include "tests/network/everykind.h"
#include "tests/network/socket/networkfixture.h"
#include "tests/storage/objectfixture.h"

namespace
{
/// One program that receives, and one that only sends.
class ExchangeTest : public MessengerTest
{
protected:
    ExchangeTest()
    {
        if (!isolated)
            return;
        receiving.setMsgPort(0);
        receiving.setTimer(&timer);
        isUp = receiving.start(true);
        sending.addReceiver("127.0.0.1", receiving.getMsgPort());
    }

    void SetUp() override
    {
        MessengerTest::SetUp();
        ASSERT_EQ(isUp, isolated);
    }

    /// Hands these bytes to the receiver in a connection of their own.
    void sendBytes(const std::string& bytes)
    {
        NStream stream;
        EXPECT_TRUE(stream.open("127.0.0.1", receiving.getMsgPort(), 10));
        stream.writeRaw(bytes.data(), static_cast<int64>(bytes.size()));
        stream.close();
    }
    static std::string bytesFor(const char* receiver, const FMessage& message)
    {
        FMemoryStream stream;
        EXPECT_TRUE(writeNetMessage(stream, receiver, message));
        return contentOf(stream);
    }
    static int countPeers(NMessenger& messenger)
    {
        CmLinkedList peers;
        peers.takeElements();
        return messenger.copyReceivers(peers);
    }

    CountingTimer timer;
    NMessenger receiving;
    NMessenger sending;
    bool isUp = false;
};
} // namespace

TEST_F(ExchangeTest, AMessageReachesTheObjectOfThatName)
{
    const WordComponents components;
    sending.setTimer(&timer);
    const auto message = makeEveryKind("kinds");
    sending.sendMessage("inbox", message);
    sending.sendMessage("nobody", message);
    deliverUntil([this] { return !inbox.received.empty(); });

    auto* received = FCast(NMessage, inbox.received[0].get());
    ASSERT_TRUE(received);
    EXPECT_EQ(differenceFromEveryKind(*received, "kinds"), "");
    EXPECT_TRUE(received->getRemoteAddress() == ConstString("127.0.0.1"));
    EXPECT_NE(received->getRemotePort(), 0);
    int64 sent = 0, arrived = 0;
    EXPECT_TRUE(received->getSentTime(sent));
    EXPECT_TRUE(received->getReceivedTime(arrived));
    EXPECT_LT(sent, arrived);
    EXPECT_FALSE(message->contains(kNetSentStamp)) << "the sender's own message stays as it was";
    // Its component must not outlive the registry.
    inbox.received.clear();
    receiving.stop();
}

TEST_F(ExchangeTest, FMessengerSendsNamedMessagesToTheNetwork)
{
    // Both sides are this process, so the object gets it from here and from there.
    receiving.addReceiver("127.0.0.1", receiving.getMsgPort());
    gMessenger->postMessage("inbox", new FMessage("both ways"), true);
    deliverUntil([this] { return inbox.received.size() == 2; });
    receiving.stop();
    gMessenger->postMessage("inbox", new FMessage("here alone"), true);
    gMessenger->deliverMessages();
    EXPECT_EQ(inbox.received.size(), 3u);
}

TEST_F(ExchangeTest, AFailedConnectionDropsThePeer)
{
    const uint16 port = receiving.getMsgPort();
    EXPECT_FALSE(sending.addReceiver("127.0.0.1", port)) << "it is known";
    EXPECT_TRUE(sending.addReceiver("127.0.0.2", port));
    EXPECT_TRUE(sending.removeReceiver("127.0.0.2", port));
    receiving.stop();
    FMessage message("m");
    sending.sendMessage("inbox", &message);
    sending.stop();
    EXPECT_EQ(countPeers(sending), 0);
}

TEST_F(ExchangeTest, DropsWhatIsNoMessageAndGoesOn)
{
    FMessage message("good");
    const std::string good = bytesFor("inbox", message);
    std::string wrongWord = good;
    wrongWord[10] = 1;
    sendBytes(wrongWord);
    sendBytes("");
    sendBytes("GET / HTTP/1.0\r\n\r\n");
    sendBytes(good.substr(0, good.size() - 1));
    sendBytes(std::string(static_cast<size_t>(kMaxNetMessage) + 1, '\0'));
    NMessage lying("lying");
    lying.setRemote(NAddress{{1, 2, 3, 4}}, 5);
    lying.setReceivedTime(6);
    receiving.setTimer(nullptr);
    sendBytes(bytesFor("inbox", lying));
    deliverUntil([this] { return !inbox.received.empty(); });
    sendBytes(good);
    deliverUntil([this] { return inbox.received.size() > 1; });
    EXPECT_EQ(inbox.types(), (std::vector<std::string>{"lying", "good"}));
    EXPECT_TRUE(inbox.received[0]->getString(kMsgRemoteIPAddr) == ConstString("127.0.0.1"));
    EXPECT_FALSE(inbox.received[0]->contains(kNetReceivedStamp));
}

TEST_F(ExchangeTest, ReadsConnectionsSideBySideUpToALimit)
{
    FMessage message("m");
    const std::string bytes = bytesFor("inbox", message);
    const size_t half = bytes.size() / 2;
    std::vector<IPtr<NStream>> streams;
    // One more than it takes at a time, and each is given only half of its message.
    for (size_t i = 0; i <= NMessageRecvThread::kMaxConnections; i++)
    {
        streams.push_back(adopt(new NStream));
        ASSERT_TRUE(streams[i]->open("127.0.0.1", receiving.getMsgPort(), 10));
        streams[i]->writeRaw(bytes.data(), static_cast<int64>(half));
    }
    for (size_t i = streams.size(); i-- > 0;)
    {
        streams[i]->writeRaw(bytes.data() + half, static_cast<int64>(bytes.size() - half));
        streams[i]->close();
    }
    deliverUntil([&] { return inbox.received.size() == streams.size(); });
}

TEST_F(MessengerTest, AConnectionThatStallsIsDropped)
{
    const std::atomic<IMicrosecondsTimer*> noTimer{nullptr};
    NMessageRecvThread thread(0, noTimer);
    thread.setStallLimit(50);
    ASSERT_TRUE(thread.open());
    ASSERT_EQ(thread.run(), 0);
    NStream stream;
    ASSERT_TRUE(stream.open("127.0.0.1", thread.getPort(), 10));
    ASSERT_TRUE(stream.writeInt32(6));
    char byte = 0;
    EXPECT_EQ(stream.readRaw(&byte, 1), 0) << "the other side closes";
}

TEST_F(MessengerTest, TakesNoMoreWhileMessagesWait)
{
    const std::atomic<IMicrosecondsTimer*> noTimer{nullptr};
    NMessageRecvThread thread(0, noTimer);
    ASSERT_TRUE(thread.open());
    ASSERT_EQ(thread.run(), 0);
    FMessage message("m");
    constexpr int kCount = NMessageRecvThread::kMaxWaitingMessages * 2;
    for (int i = 0; i < kCount; i++)
    {
        NStream stream;
        ASSERT_TRUE(stream.open("127.0.0.1", thread.getPort(), 10));
        ASSERT_TRUE(writeNetMessage(stream, "inbox", message));
    }
    size_t most = 0;
    while (inbox.received.size() < kCount)
    {
        const size_t before = inbox.received.size();
        gMessenger->deliverMessages();
        most = std::max(most, inbox.received.size() - before);
        std::this_thread::sleep_for(std::chrono::milliseconds(50));
    }
    // Those that were taken already may come on top.
    EXPECT_LE(most, NMessageRecvThread::kMaxWaitingMessages + NMessageRecvThread::kMaxConnections);
}

TEST_F(ExchangeTest, ManyMessagesAreAllSentBeforeItStops)
{
    FMessage message("m");
    constexpr size_t kCount = NWorkCrew::kMaxThreads * 3;
    std::thread sender(
        [&]
        {
            for (size_t i = 0; i < kCount; i++)
                sending.sendMessage("inbox", &message);
        });
    deliverUntil([&] { return inbox.received.size() == kCount; });
    sender.join();
}

TEST(NWorkCrew, EndsUndoneWhatComesTooFast)
{
    struct Work final : FWorkClass
    {
        Work(FCondition& gate, std::atomic<size_t>& ended) : opens(gate), count(ended) {}
        void performThreadWork(void*) override
        {
            opens.wait();
            opens.signal();
        }
        void finished() override
        {
            count++;
            delete this;
        }
        FCondition& opens;
        std::atomic<size_t>& count;
    };
    constexpr size_t kRoom = NWorkCrew::kMaxThreads + NWorkCrew::kMaxWaiting;
    FCondition gate;
    std::atomic<size_t> ended = 0;
    NWorkCrew crew("held", kThreadPriorityLow);
    for (size_t i = 0; i < kRoom + 3; i++)
        crew.add(new Work(gate, ended));
    EXPECT_EQ(ended, 3u);
    gate.signal();
    crew.end(0);
    EXPECT_EQ(ended, kRoom + 3);
}

TEST_F(ExchangeTest, APeerCanTellOfItself)
{
    FMessage message(kNetMessengerName);
    message.addInt(kNetMessagePortKey, 4711);
    const auto url = adopt(new FUrl);
    NReceiver("127.0.0.1", receiving.getMsgPort()).getUrl(*url);
    EXPECT_TRUE(sending.sendMessageTo(url, kNetMessengerName, &message));
    deliverUntil([this] { return countPeers(receiving) == 1; });
    CmLinkedList peers;
    peers.takeElements();
    receiving.copyReceivers(peers);
    EXPECT_TRUE(NReceiver("127.0.0.1", 4711).isEqual(peers.at(0)));

    EXPECT_FALSE(sending.sendMessageTo(nullptr, "inbox", &message));
    message.addPointer("pointer", this);
    EXPECT_FALSE(sending.sendMessageTo(url, "inbox", &message));
}

TEST_F(ExchangeTest, AnswersRequestsForHosts)
{
    sending.requestHostName("localhost", &inbox);
    deliverUntil([this] { return !inbox.received.empty(); });
    FMessage& answer = *inbox.received[0];
    EXPECT_TRUE(answer.isType(kIpToNameResult));
    EXPECT_TRUE(answer.getString(kNetHost) == ConstString("localhost"));
    EXPECT_TRUE(answer.getString(kNetIP) == ConstString("127.0.0.1"));

    sending.requestHostName("127.0.0.1", &inbox);
    deliverUntil([this] { return inbox.received.size() == 2; });
    EXPECT_TRUE(inbox.received[1]->getString(kNetIP) == ConstString("127.0.0.1"));

    sending.requestHostName("localhost", &inbox);
    sending.cancelRequests(&inbox);
    sending.stop();
    gMessenger->deliverMessages();
    // It may have been answered before it was cancelled.
    EXPECT_LE(inbox.received.size(), 3u);

    String text;
    EXPECT_TRUE(sending.hostNameToIP("localhost", text));
    EXPECT_STREQ(text.text8(), "127.0.0.1");
    EXPECT_FALSE(sending.ipToHostName("localhost", text)) << "it isn't one";
}

TEST_F(ExchangeTest, TheEndOfTheApplicationStopsIt)
{
    ApplicationSteps::get().stopNetMessenger();
    NStream stream;
    EXPECT_FALSE(stream.open("127.0.0.1", receiving.getMsgPort(), 10));
}

TEST_F(ExchangeTest, StartsOnceAndAgain)
{
    EXPECT_EQ(gNetMessenger, &receiving) << "the first one made";
    EXPECT_TRUE(receiving.start(true)) << "it runs already";
    const uint16 port = receiving.getMsgPort();
    NMessenger second;
    second.setMsgPort(port);
    EXPECT_FALSE(second.start(true)) << "the port is taken";
    second.stop();
    receiving.stop();
    EXPECT_TRUE(receiving.start());
    EXPECT_EQ(receiving.getMsgPort(), port);
    String address;
    receiving.getLocalAddress(address);
    EXPECT_STREQ(address.text8(), "127.0.0.1") << "there is no other in this network";
    EXPECT_FALSE(receiving.sendHelloMessage()) << "there is nobody to say it to";
    FMessage message("again");
    sending.sendMessage("inbox", &message);
    deliverUntil([this] { return !inbox.received.empty(); });
}

TEST_F(MessengerTest, UrlsOfTheMessengersProtocolOpenAConnection)
{
    NMessenger registersTheProtocol;
    NServer server(0, 1);
    server.setAddress("127.0.0.1");
    ASSERT_TRUE(server.open());
    const auto url = adopt(new FUrl);
    NReceiver("127.0.0.1", server.getLocalPort()).getUrl(*url);
    IBStream* stream = nullptr;
    ASSERT_EQ(url->openStream(&stream), 0);
    const auto held = adopt(stream);
    const auto accepted = adopt(server.waitForConnection());
    ASSERT_TRUE(accepted);
    int32 number = 5;
    EXPECT_EQ(stream->write(&number, sizeof number, nullptr), 0);
    EXPECT_TRUE(url->getHandler()->close());
    EXPECT_FALSE(url->getHandler()->close());
    number = 0;
    EXPECT_TRUE(accepted->readInt32(number));
    EXPECT_EQ(number, 5);
    server.close();
    EXPECT_FALSE(url->getHandler()->open());
    EXPECT_EQ(url->getHandler()->getStream(), nullptr);
}
