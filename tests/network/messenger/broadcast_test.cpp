#include "containers/value/cmbuffer.h"
#include "messengerfixture.h"
#include "network/messenger/nbroadcastrecvthread.h"
#include "network/messenger/nbroadcasttext.h"
#include "network/messenger/nreceiver.h"

namespace
{
using Types = std::vector<std::string>;

constexpr char kHello[] = "pock...pock...VELLAMOOR My%20Program 1.2 7000 studio%20a 1";
const NAddress kOther{{192, 0, 2, 5}};

bool parses(const std::string& text)
{
    NBroadcastText parsed;
    return parsed.parse(text.data(), static_cast<unsigned>(text.size()));
}

/// A messenger that doesn't run, and its ear.
class BroadcastTest : public MessengerTest
{
protected:
    BroadcastTest() { messenger.addToNotifyGroup(&inbox); }

    void hear(const std::string& text, const NAddress& sender = kOther, int64 time = 0)
    {
        CmBuffer data(text.data(), static_cast<uint32>(text.size()));
        ear.handleBroadcastMessage(data, time, sender, 50000);
    }
    void deliver()
    {
        askedForHello = gMessenger->messagesPosted(&messenger, kSendHalloMsg);
        // A hello waits for a while.
        do
            gMessenger->deliverMessages();
        while (gMessenger->areMessagesPosted(&messenger, kSendHalloMsg));
    }
    int countPeers()
    {
        CmLinkedList peers;
        peers.takeElements();
        return messenger.copyReceivers(peers);
    }

    NMessenger messenger;
    NBroadcastRecvThread ear{messenger, 0};
    int askedForHello = 0;
};
} // namespace

TEST(NBroadcastText, PrintsAndReadsItsValues)
{
    NBroadcastText text;
    text.program = u"My Program";
    text.version = "1.2";
    text.port = 7000;
    text.host = "studio a";
    EXPECT_EQ(text.print(), kHello);

    NBroadcastText read;
    ASSERT_TRUE(read.parse(kHello, sizeof kHello - 1));
    EXPECT_TRUE(read.isHello);
    EXPECT_TRUE(read.program == ConstString("My Program"));
    EXPECT_TRUE(read.version == ConstString("1.2"));
    EXPECT_EQ(read.port, 7000);
    EXPECT_TRUE(read.host == ConstString("studio a"));

    NBroadcastText empty;
    empty.isHello = false;
    empty.port = 65535;
    EXPECT_EQ(empty.print(), "bye bye unknown unknown 65535 unknown 1");
}

TEST(NBroadcastText, IgnoresEverythingElse)
{
    EXPECT_TRUE(parses("bye bye a b 1 c"));
    EXPECT_TRUE(parses("pock...pock...VELLAMOOR a b 1 c 2 later values"));
    for (const char* text :
         {"", "pock", "Pock...pock...VELLAMOOR a b 1 c", "pock...pock...VELLAMOOR",
          "pock...pock...VELLAMOOR a b 1", "pock...pock...VELLAMOOR a b 0 c",
          "pock...pock...VELLAMOOR a b 65536 c", "pock...pock...VELLAMOOR a b x c", "hello a b 1 c"})
        EXPECT_FALSE(parses(text)) << text;
    EXPECT_FALSE(parses(std::string(kHello) + std::string(NBroadcastText::kMaxSize, 'x'))) << "too long";
    EXPECT_FALSE(parses(std::string("pock...pock...VELLAMOOR a b\0 1 c", 32))) << "a zero ends the text";
}

TEST_F(BroadcastTest, AHelloEntersThePeerAndAsksForAHelloOnce)
{
    hear(kHello, kOther, 99);
    EXPECT_EQ(countPeers(), 1);
    hear(kHello);
    EXPECT_EQ(countPeers(), 1);
    deliver();
    EXPECT_EQ(askedForHello, 1);
    ASSERT_EQ(inbox.types(), (Types{kNetAvailableMessage, kNetAvailableMessage}));
    FMessage& news = *inbox.received[0];
    EXPECT_TRUE(news.getString(kNetProgramName) == ConstString("My Program"));
    EXPECT_TRUE(news.getString(kNetProgramVersion) == ConstString("1.2"));
    EXPECT_TRUE(news.getString(kNetSender) == ConstString("studio a"));
    EXPECT_TRUE(news.getString(kMsgRemoteIPAddr) == ConstString("192.0.2.5"));
    EXPECT_EQ(news.getData(kMsgRemotePort), 7000) << "the port for messages, not the one it came from";
    int64 time = 0;
    EXPECT_TRUE(FCast(NMessage, &news)->getReceivedTime(time));
    EXPECT_EQ(time, 99);

    hear("bye bye My%20Program 1.2 7000 studio%20a 1");
    EXPECT_EQ(countPeers(), 0);
    deliver();
    EXPECT_EQ(askedForHello, 0);
    EXPECT_EQ(inbox.types().back(), kNetByeByeMessage);
}

TEST_F(BroadcastTest, DropsItsOwnHelloAndWhatIsNone)
{
    const std::string own = "pock...pock...VELLAMOOR a b 6991 c 1";
    hear(own, kLoopbackAddress);
    hear("who is there?");
    hear("");
    EXPECT_EQ(countPeers(), 0);
    hear(own);
    EXPECT_EQ(countPeers(), 1) << "the port alone is not oneself";
    hear("pock...pock...VELLAMOOR a b 7001 c 1", kLoopbackAddress);
    EXPECT_EQ(countPeers(), 2) << "nor is the host alone";
    deliver();
    EXPECT_EQ(inbox.received.size(), 2u);
}

TEST_F(BroadcastTest, LimitsWhatOthersCanMakeItHold)
{
    for (int i = 0; i < NMessenger::kMaxReceivers + 10; i++)
        hear("pock...pock...VELLAMOOR a b " + std::to_string(10000 + i) + " c 1");
    EXPECT_EQ(countPeers(), NMessenger::kMaxReceivers);
    EXPECT_LT(gMessenger->messagesPosted(&inbox, nullptr), NMessenger::kMaxReceivers);
    EXPECT_EQ(gMessenger->messagesPosted(&messenger, kSendHalloMsg), 1);

    messenger.removeFromNotifyGroup(&inbox);
    gMessenger->killMessages(&inbox, nullptr);
    hear("bye bye a b 10000 c 1");
    EXPECT_EQ(countPeers(), NMessenger::kMaxReceivers - 1);
    deliver();
    EXPECT_TRUE(inbox.received.empty()) << "it has left the group";
}
