#include "foundation/message/fmessage.h"
#include "tests/job/process.h"
#include "tests/network/http/httpfixture.h"
#include "tests/network/http/peer.h"

#include <thread>

// None of these would ever end by itself: that they do is the test.

namespace
{
class Cancel : public HttpTest
{
protected:
    /// Opens on a worker; the cancel comes once the peer was asked and `isTime` holds.
    template <class Condition>
    static bool openAndCancel(FUrlHandler& handler, const Peer& peer, Condition isTime)
    {
        bool isOpen = true;
        std::thread worker([&] { isOpen = handler.open(); });
        peer.waitForRequest();
        EXPECT_TRUE(waitUntil(isTime));
        handler.cancel();
        worker.join();
        return isOpen;
    }
    static bool openAndCancel(FUrlHandler& handler, const Peer& peer)
    {
        return openAndCancel(handler, peer, [] { return true; });
    }
};

Peer::Answer held(const std::string& bytes)
{
    return {bytes, true};
}
} // namespace

TEST_F(Cancel, EndsARunOfEndlessRedirections)
{
    Peer peer([&](const std::string&, size_t)
              { return Peer::Answer{"HTTP/1.0 302 x\r\nLocation: " + peer.url() + "\r\n\r\n"}; });
    FUrl url(wide(peer.url()).text16());
    url.makeHandler();
    EXPECT_FALSE(openAndCancel(*url.getHandler(), peer, [&] { return peer.requests().size() > 20; }));
    EXPECT_EQ(url.getHandler()->getStream(), nullptr);
}

TEST_F(Cancel, EndsTheWaitForASilentPeer)
{
    for (const char* begin : {"", "HTTP/1.0 200", "HTTP/1.0 200 OK\r\nA: b\r\n"})
    {
        Peer peer([=](const std::string&, size_t) { return held(begin); });
        FUrl url(wide(peer.url()).text16());
        url.makeHandler();
        EXPECT_FALSE(openAndCancel(*url.getHandler(), peer)) << begin;
    }
}

TEST_F(Cancel, EndsTheReadingOfABody)
{
    Peer peer([](const std::string&, size_t) { return held("HTTP/1.0 200 OK\r\n\r\nbody"); });
    FUrl url(wide(peer.url()).text16());
    url.makeHandler();
    FUrlHandler* handler = url.getHandler();
    ASSERT_TRUE(handler->open());
    std::string body;
    std::thread reader([&] { body = readAll(*handler->getStream()); });
    handler->cancel();
    reader.join();
    EXPECT_TRUE(body.empty() || body == "body");
    EXPECT_FALSE(handler->getStream()->verify()) << "this was no end of a body";
    EXPECT_TRUE(handler->close());
    EXPECT_TRUE(handler->open()) << "a cancel ends one run, not those that follow";
    EXPECT_TRUE(handler->close());
}

TEST_F(Cancel, IsNotLostBeforeARunBegins)
{
    Peer peer({"HTTP/1.0 200 OK\r\n\r\nbody"});
    FUrl url(wide(peer.url()).text16());
    url.makeHandler();
    url.getHandler()->cancel();
    EXPECT_FALSE(url.getHandler()->open());
    EXPECT_EQ(peer.requests().size(), 0u);
    EXPECT_TRUE(url.getHandler()->open());
}

TEST_F(Cancel, EndsTheWaitForTheUserWhoseLateAnswerIsDropped)
{
    const std::string refusal = "HTTP/1.0 401 x\r\nWWW-Authenticate: Basic\r\n\r\n";
    Peer peer({refusal, refusal, "HTTP/1.0 200 OK\r\n\r\nbody"});
    FUrl url(wide(peer.url()).text16());
    auto handler = adopt(new Asked<FUrlHttpHandler>(url));
    handler->user = [](FString& name, FString&)
    {
        name = u"late";
        return true;
    };
    const auto isAsking = [&] { return gMessenger->areMessagesPosted(handler.get(), "authenticate WWW"); };
    EXPECT_FALSE(openAndCancel(*handler, peer, isAsking));
    gMessenger->deliverMessages();
    EXPECT_EQ(handler->questions, 0) << "nobody waits for the answer";

    // Cancelled while the user types: the next run begins with a question of its own.
    std::atomic<bool> isTyping = false, isOver = false;
    handler->user = [&](FString& name, FString&)
    {
        isTyping = true;
        EXPECT_TRUE(waitUntil([&] { return isOver.load(); }));
        name = u"late";
        return true;
    };
    onWorker(
        [&]
        {
            std::thread canceller(
                [&]
                {
                    EXPECT_TRUE(waitUntil([&] { return isTyping.load(); }));
                    handler->cancel();
                });
            EXPECT_FALSE(handler->open());
            canceller.join();
            EXPECT_TRUE(handler->open());
            isOver = true;
        });
    EXPECT_EQ(peer.requests().back().find("Authorization"), std::string::npos);
}

TEST_F(Cancel, LeavesALateQuestionNothingToFear)
{
    Peer peer({"HTTP/1.0 401 x\r\nWWW-Authenticate: Basic\r\n\r\n"});
    {
        FUrl url(wide(peer.url()).text16());
        url.makeHandler();
        FUrlHandler* handler = url.getHandler();
        EXPECT_FALSE(openAndCancel(
            *handler, peer, [&] { return gMessenger->areMessagesPosted(handler, "authenticate WWW"); }));
    }
    testing::internal::CaptureStderr();
    gMessenger->deliverMessages();
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "") << "URL and worker are gone";
}

TEST_F(Cancel, IsNotNeededWhereThePatienceHasAnEnd)
{
    Peer peer([](const std::string&, size_t) { return held("HTTP/1.0 200 OK\r\n"); });
    FUrl url(wide(peer.url()).text16());
    FUrlHttpHandler* handler = new FUrlHttpHandler(url);
    handler->setStallLimit(10);
    EXPECT_FALSE(handler->open()) << "silence isn't the end of a reply";
    EXPECT_TRUE(handler->getRedirected().isEmpty());
    handler->release();
}
