#include "network/http/furlhttpshandler.h"

#include "network/http/furltlsstream.h"
#include "network/http/httpproxy.h"
#include "network/http/httprequest.h"
#include "storage/url/furl.h"

FUrlStream* FUrlHttpsHandler::newStream()
{
    return new FUrlTlsStream;
}

FUrlHttpHandler::Next FUrlHttpsHandler::connect(const HttpProxy& proxy)
{
    Next next = FUrlHttpHandler::connect(proxy);
    if (next == Next::kDone && proxy.isUsed())
        next = openTunnel(proxy);
    if (next != Next::kDone)
        return next;
    return static_cast<FUrlTlsStream*>(stream)->encrypt(url.getHost()) ? Next::kDone : Next::kFailed;
}

FUrlHttpHandler::Next FUrlHttpsHandler::openTunnel(const HttpProxy& proxy)
{
    HttpRequest request;
    request.connect(url);
    addProxyCredentials(request, proxy);
    request.finish();
    if (!send(request))
        return Next::kFailed;

    HttpReplyHead head(*stream);
    const HttpReplyHead::End end = head.read();
    if (end == HttpReplyHead::End::kProxyAuthenticate && willAuthenticateToProxy(proxy))
        return Next::kAgain;
    const bool isThrough = head.getStatus() >= 200 && head.getStatus() <= 299;
    return end == HttpReplyHead::End::kBlankLine && isThrough ? Next::kDone : Next::kFailed;
}

void FUrlHttpsHandler::makeRequest(HttpRequest& request, const HttpProxy&)
{
    request.get(url, getDefaultPort());
}

FUrlHandler* createUrlHttpsHandler(FUrl& url)
{
    return new FUrlHttpsHandler(url);
}

void initFUrlHttpsHandler()
{
    FUrl::registerHandler(FString("https"), FUrlHttpsHandler::kPort, createUrlHttpsHandler);
}
