#pragma once

#include "foundation/message/fmessenger.h"
#include "network/http/furlhttphandler.h"
#include "network/http/furlhttpshandler.h"
#include "services/defaults/fdefaultpool.h"
#include "storage/url/furl.h"
#include "tests/storage/filefixture.h"

#include <atomic>
#include <functional>

/// What an `open` came to.
struct Outcome
{
    bool isOpen = false;
    int64 length = 0;
    std::string body;
    std::string redirected;
    /// The URL as it is then.
    std::string url;

    bool operator==(const Outcome& other) const = default;
};
void PrintTo(const Outcome& outcome, std::ostream* stream);

/// A handler with a user: tells what it is asked, and answers what a test lets it.
template <class Handler>
class Asked : public Handler
{
public:
    explicit Asked(FUrl& askedUrl) : Handler(askedUrl) {}

    /// On the main thread; false cancels.
    std::function<bool(FString& name, FString& secret)> user;
    std::atomic<int> questions = 0;

protected:
    bool askUser(FString& name, FString& secret) override
    {
        questions++;
        return user ? user(name, secret) : Handler::askUser(name, secret);
    }
};

/// A messenger, settings and registered handlers; transfers run on a thread of their own while messages are delivered.
class HttpTest : public FileTest
{
protected:
    static void SetUpTestSuite();
    void SetUp() override;
    void TearDown() override;

    void set(const char* key, int32 value) { defaults->setLong("HttpHandlerDefaults", key, value); }
    void set(const char* key, const char* text) { defaults->setTString("HttpHandlerDefaults", key, text); }
    void useProxy(int port);
    void useProxyCredentials(const char* name, const char* secret);

    /// Runs it on a worker and delivers messages until it is through.
    static void onWorker(const std::function<void()>& work);
    /// Opens, reads to the end and closes.
    static Outcome get(FUrl& url, FUrlHandler& handler);
    Outcome get(const std::string& text);
    /// With a user who types these.
    template <class Handler = FUrlHttpHandler>
    Outcome getAs(const std::string& text, const char16* name, const char16* secret);

    IPtr<FDefaultPool> defaults;
};

FString wide(const std::string& text);
std::string readAll(FStream& stream);

template <class Handler>
Outcome HttpTest::getAs(const std::string& text, const char16* name, const char16* secret)
{
    FUrl url(wide(text).text16());
    const auto handler = adopt(new Asked<Handler>(url));
    handler->user = [=](FString& userName, FString& userSecret)
    {
        userName = name;
        userSecret = secret;
        return true;
    };
    return get(url, *handler);
}
