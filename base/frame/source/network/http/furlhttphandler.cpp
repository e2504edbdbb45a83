#include "network/http/furlhttphandler.h"

#include "foundation/message/fmessage.h"
#include "foundation/message/fmessenger.h"
#include "foundation/object/iptr.h"
#include "foundation/text/utranslatedstring.h"
#include "foundation/thread/flockscope.h"
#include "foundation/thread/fthread.h"
#include "network/http/furlstream.h"
#include "network/http/httpproxy.h"
#include "network/http/httprequest.h"
#include "storage/path/filenametext.h"
#include "storage/url/furl.h"
#include "views/dialog/ucommondialog.h"

#include <atomic>

namespace
{
constexpr const char* kAuthenticateMessage = "authenticate WWW";
constexpr const char* kQuestion = "Question";
// In seconds.
constexpr int kConnectLimit = 6;
// In milliseconds. Servers may think for long before they answer.
constexpr int kStallLimit = 60000;

// The one that registers the handlers.
std::atomic<FThreadID> mainThread = 0;

UTranslatedString stringAuthenticate("Authentication Required");
} // namespace

/// The time that an `open` takes. Its end uses up the cancel that ended it.
class FUrlHttpHandler::Run
{
public:
    explicit Run(FUrlHttpHandler& runningHandler) : handler(runningHandler)
    {
        FLockScope guard(handler.lock);
        handler.isOpening = true;
    }
    ~Run()
    {
        FLockScope guard(handler.lock);
        handler.isOpening = false;
        handler.cancelled = false;
    }

private:
    FUrlHttpHandler& handler;
};

FUrlHttpHandler::FUrlHttpHandler(FUrl& handledUrl) : FUrlHandler(handledUrl), stallLimit(kStallLimit) {}

FUrlHttpHandler::~FUrlHttpHandler()
{
    closeStream();
}

bool FUrlHttpHandler::open()
{
    Run run(*this);
    Next next = Next::kAgain;
    while (next == Next::kAgain)
        next = exchange();
    if (isCancelled())
    {
        closeStream();
        return false;
    }
    return next == Next::kDone;
}

bool FUrlHttpHandler::close()
{
    return closeStream();
}

bool FUrlHttpHandler::closeStream()
{
    FUrlStream* closing = nullptr;
    {
        FLockScope guard(lock);
        closing = static_cast<FUrlStream*>(stream);
        stream = nullptr;
    }
    if (!closing)
        return false;
    const bool result = closing->close();
    closing->setUrl(nullptr);
    closing->release();
    return result;
}

void FUrlHttpHandler::cancel()
{
    IPtr<FUrlStream> running;
    {
        FLockScope guard(lock);
        running = static_cast<FUrlStream*>(stream);
        cancelled = cancelled || isOpening || !running;
    }
    if (running)
        running->cancel();
    answered.signal();
}

bool FUrlHttpHandler::isCancelled()
{
    FLockScope guard(lock);
    return cancelled;
}

// One request and its reply

FUrlHttpHandler::Next FUrlHttpHandler::exchange()
{
    closeStream();
    length = 0;
    redirected.assign(u"");
    // A redirection, or who owns the URL, may have named another server since the user typed.
    if (!isUsersServer())
        forgetUser();
    const HttpProxy proxy = HttpProxy::fromDefaults();
    const Next connected = connect(proxy);
    if (connected != Next::kDone)
    {
        closeStream();
        return connected;
    }
    HttpRequest request;
    makeRequest(request, proxy);
    if (authenticated)
        request.addCredentials("Authorization", user, password);
    request.finish();
    return send(request) ? readReply(proxy) : Next::kFailed;
}

FUrlHttpHandler::Next FUrlHttpHandler::connect(const HttpProxy& proxy)
{
    const bool isOpen = proxy.isUsed() ? openStream(proxy.host, proxy.port)
                                       : openStream(url.getHost(), static_cast<uint16>(url.getPort()));
    return isOpen ? Next::kDone : Next::kFailed;
}

bool FUrlHttpHandler::openStream(const FString& host, uint16 port)
{
    const auto opening = adopt(newStream());
    opening->setUrl(&url);
    opening->setStallLimit(stallLimit);
    {
        FLockScope guard(lock);
        opening->addRef();
        stream = opening;
    }
    // A cancel that came before the stream was there is seen here, a later one has reached the stream.
    return !isCancelled() && opening->open(FileNameText::toBytes(host).c_str(), port, kConnectLimit) &&
           !isCancelled();
}

FUrlStream* FUrlHttpHandler::newStream()
{
    return new FUrlStream;
}

void FUrlHttpHandler::makeRequest(HttpRequest& request, const HttpProxy& proxy)
{
    if (proxy.isUsed())
    {
        request.getThroughProxy(url, getDefaultPort());
        addProxyCredentials(request, proxy);
    }
    else
        request.get(url, getDefaultPort());
}

void FUrlHttpHandler::addProxyCredentials(HttpRequest& request, const HttpProxy& proxy) const
{
    if (proxyAuthenticated || proxy.authenticate)
        request.addCredentials("Proxy-Authorization", proxy.user, proxy.password);
}

bool FUrlHttpHandler::send(const HttpRequest& request)
{
    const std::string& text = request.getText();
    const auto size = static_cast<int64>(text.size());
    if (request.isSound() && stream->writeRaw(text.data(), size) == size)
        return true;
    closeStream();
    return false;
}

FUrlHttpHandler::Next FUrlHttpHandler::readReply(const HttpProxy& proxy)
{
    HttpReplyHead head(*stream);
    HttpReplyHead::End end = head.read();
    // What asks for credentials that it had already is no news.
    while (end == HttpReplyHead::End::kProxyAuthenticate && !willAuthenticateToProxy(proxy))
        end = head.read();
    length = head.getLength();
    switch (end)
    {
    case HttpReplyHead::End::kBlankLine:
        return head.isError() ? Next::kFailed : Next::kDone;
    case HttpReplyHead::End::kLocation:
        return redirect(head.getLocation());
    case HttpReplyHead::End::kProxyAuthenticate:
        closeStream();
        return Next::kAgain;
    case HttpReplyHead::End::kAuthenticate:
        return authenticate();
    case HttpReplyHead::End::kCut:
        redirected = head.getLines();
        return redirected.isEmpty() ? Next::kFailed : Next::kDone;
    case HttpReplyHead::End::kFailed:
        break;
    }
    closeStream();
    return Next::kFailed;
}

FUrlHttpHandler::Next FUrlHttpHandler::redirect(const FString& location)
{
    url.setUrl(location.text16());
    closeStream();
    const bool isOwn = url.getProtocol() == ConstString(getOwnProtocol());
    return isOwn && !isCancelled() ? Next::kAgain : Next::kFailed;
}

bool FUrlHttpHandler::willAuthenticateToProxy(const HttpProxy& proxy)
{
    if (!proxy.isUsed() || proxyAuthenticated)
        return false;
    proxyAuthenticated = true;
    return true;
}

// The user's name and password

FUrlHttpHandler::Next FUrlHttpHandler::authenticate()
{
    closeStream();
    authenticated = true;
    userHost = url.getHost();
    userPort = url.getPort();
    // A URL may bring along what the user is shown first.
    if (user.isEmpty())
    {
        user = url.getUser();
        password = url.getPassword();
    }
    if (ask())
        return Next::kAgain;
    forgetUser();
    return Next::kFailed;
}

bool FUrlHttpHandler::isUsersServer() const
{
    return userPort == url.getPort() && userHost.compare(url.getHost(), kCaseInsensitive) == 0;
}

void FUrlHttpHandler::forgetUser()
{
    authenticated = false;
    user.assign(u"");
    password.assign(u"");
}

bool FUrlHttpHandler::ask()
{
    auto message = adopt(new FMessage(kAuthenticateMessage));
    {
        FLockScope guard(lock);
        if (cancelled)
            return false;
        answered.reset();
        dialogResult = false;
        message->addData(kQuestion, ++question);
    }
    if (FThread::currentThreadID() == mainThread)
        notify(message);
    else if (FMessenger* messenger = gMessenger)
    {
        // Whoever cancels may let go of the handler before the message arrives.
        message->add("Handler", this, true);
        messenger->postMessage(this, message.take());
        answered.wait();
    }

    FLockScope guard(lock);
    question++;
    return dialogResult && !cancelled;
}

int FUrlHttpHandler::notify(FMessage* message)
{
    if (!message || !message->isType(kAuthenticateMessage))
        return FUrlHandler::notify(message);

    const int64 number = message->getData(kQuestion);
    FString name, secret;
    {
        FLockScope guard(lock);
        if (number != question)
            return 0;
        name = user;
        secret = password;
    }
    const bool result = askUser(name, secret);
    FLockScope guard(lock);
    if (number != question)
        return 0;
    user = name;
    password = secret;
    dialogResult = result;
    answered.signal();
    return 1;
}

bool FUrlHttpHandler::askUser(FString& name, FString& secret)
{
    return UCommonDialog::getNameAndPassword(stringAuthenticate.text(), name, secret);
}

FUrlHandler* createUrlHttpHandler(FUrl& url)
{
    return new FUrlHttpHandler(url);
}

void initFUrlHttpHandler()
{
    mainThread = FThread::currentThreadID();
    FUrl::registerHandler(FString("http"), FUrlHttpHandler::kPort, createUrlHttpHandler);
}
