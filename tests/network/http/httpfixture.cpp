#include "tests/network/http/httpfixture.h"

#include "application/urlprotocols.h"
#include "tests/job/process.h"

#include <ostream>
#include <thread>

void PrintTo(const Outcome& outcome, std::ostream* stream)
{
    *stream << (outcome.isOpen ? "open, " : "failed, ") << outcome.length << " bytes, body \"" << outcome.body
            << "\", redirected \"" << outcome.redirected << "\", at " << outcome.url;
}

FString wide(const std::string& text)
{
    FString result;
    FileNameText::fromBytes(text.c_str(), result);
    return result;
}

std::string readAll(FStream& stream)
{
    std::string result;
    char block[4096];
    for (int64 count; (count = stream.readRaw(block, sizeof block)) > 0;)
        result.append(block, static_cast<size_t>(count));
    return result;
}

void HttpTest::SetUpTestSuite()
{
    EXPECT_TRUE(registerUrlProtocols());
}

void HttpTest::SetUp()
{
    FileTest::SetUp();
    gMessenger = FMessenger::instance();
    defaults = adopt(new FDefaultPool);
    gDefaultPool = defaults;
}

void HttpTest::TearDown()
{
    gDefaultPool = nullptr;
    gMessenger = nullptr;
    FileTest::TearDown();
}

void HttpTest::useProxy(int port)
{
    set("Use Proxy", 1);
    set("Proxy Host", "127.0.0.1");
    set("Proxy Port", port);
}

void HttpTest::useProxyCredentials(const char* name, const char* secret)
{
    set("Proxy User", name);
    set("Proxy Passwd", secret);
}

void HttpTest::onWorker(const std::function<void()>& work)
{
    std::atomic<bool> isDone = false;
    std::thread worker(
        [&]
        {
            work();
            isDone = true;
        });
    while (!isDone)
    {
        gMessenger->deliverMessages();
        pauseBriefly();
    }
    worker.join();
    gMessenger->deliverMessages();
}

Outcome HttpTest::get(FUrl& url, FUrlHandler& handler)
{
    Outcome outcome;
    onWorker(
        [&]
        {
            outcome.isOpen = handler.open();
            outcome.length = handler.getLength();
            if (FStream* stream = handler.getStream())
                outcome.body = readAll(*stream);
            outcome.redirected = utf8(static_cast<FUrlHttpHandler&>(handler).getRedirected());
            FString text;
            url.getUrl(text);
            outcome.url = utf8(text);
            handler.close();
        });
    return outcome;
}

Outcome HttpTest::get(const std::string& text)
{
    FUrl url(wide(text).text16());
    EXPECT_TRUE(url.makeHandler());
    return get(url, *url.getHandler());
}
