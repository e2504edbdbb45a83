#pragma once

#include "foundation/text/fstring.h"
#include "foundation/thread/fcondition.h"
#include "foundation/thread/flock.h"
#include "network/http/httpreplyhead.h"
#include "storage/url/furlhandler.h"

class FUrlStream;
class HttpRequest;
struct HttpProxy;

/// Gets what a URL of the protocol "http" names: one GET of HTTP/1.0, after which the stream stands at the body.
///
/// It goes where redirections lead, however many they are, as long as the protocol stays the same; goes through the
/// proxy of the user's settings; and asks the user for name and password where a server wants them for the scheme
/// "Basic". What the user typed for one server never goes to another. HttpReplyHead tells what is read of a reply.
///
/// For a worker thread: a question waits for the main thread, which shows it at its next pulse. (On the main thread
/// it is shown at once.) Any thread may `cancel`; everything else is for one thread at a time.
class FUrlHttpHandler : public FUrlHandler
{
    DECLARE_TYPE(FUrlHttpHandler, FUrlHandler)

    static constexpr uint16 kPort = 80;

    explicit FUrlHttpHandler(FUrl& handledUrl);
    ~FUrlHttpHandler() override;
    CmObject* newCopy() const override { return nullptr; }

    /// False where no reply can be had, and where its status is an error (400 to 599), of which the stream has the
    /// body then. A reply without an end of its head is true if it has any whole line; see `getRedirected`.
    bool open() override;
    /// Also for what a failed `open` left.
    bool close() override;
    /// Ends the `open` under way, or the next one where none is, and all reading from the stream. Any thread.
    void cancel() override;
    /// The answer of the user to a question of `open`. Main thread.
    int notify(FMessage* message) override;

    /// The whole lines of a reply that ended before its head did, else empty.
    const FString& getRedirected() const { return redirected; }
    /// How long the other side may stay silent, in milliseconds; -1 is for ever.
    void setStallLimit(int milliseconds) { stallLimit = milliseconds; }

protected:
    enum class Next
    {
        kDone,
        kFailed,
        kAgain
    };

    // What differs where connections are encrypted
    virtual const char* getOwnProtocol() const { return "http"; }
    virtual uint16 getDefaultPort() const { return kPort; }
    /// A new stream; the caller gets the reference.
    virtual FUrlStream* newStream();
    /// Connects the stream to whom the request goes. `kDone` goes on with the request.
    virtual Next connect(const HttpProxy& proxy);
    /// Adds all but the user's credentials and the end.
    virtual void makeRequest(HttpRequest& request, const HttpProxy& proxy);

    /// Asks the user for both, beginning with what they hold; false where they cancel. Main thread.
    virtual bool askUser(FString& name, FString& secret);

    /// Makes the stream and connects it.
    bool openStream(const FString& host, uint16 port);
    bool send(const HttpRequest& request);
    /// For requests that a proxy gets: a server that is reached without one must never see these credentials.
    void addProxyCredentials(HttpRequest& request, const HttpProxy& proxy) const;
    /// Whether a 407 makes the request go out again, now with the credentials for the proxy. It does so once: a proxy
    /// that doesn't like them would be asked for ever, and no user is there to change them. It doesn't for a 407 of a
    /// server that is no proxy, to which there is nothing to add. Such a reply is an error like any other.
    bool willAuthenticateToProxy(const HttpProxy& proxy);

private:
    class Run;

    Next exchange();
    Next readReply(const HttpProxy& proxy);
    Next redirect(const FString& location);
    Next authenticate();
    bool ask();
    bool isCancelled();
    bool closeStream();
    bool isUsersServer() const;
    void forgetUser();

    FString redirected;
    bool proxyAuthenticated = false;
    bool authenticated = false;
    FString user;
    FString password;
    bool dialogResult = false;
    FCondition answered{"authentication"};
    // Whom the user's name and password are for.
    FString userHost;
    int16 userPort = 0;
    int stallLimit;
    // Guards the stream's pointer, what follows, and the answer to a question.
    FLock lock{"http handler"};
    bool isOpening = false;
    bool cancelled = false;
    // Counts up when a question begins and when it is over, so that a late answer is told from a wanted one.
    int64 question = 0;
};

FUrlHandler* createUrlHttpHandler(FUrl& url);
/// Registers the handler; once at start, on the main thread.
void initFUrlHttpHandler();
