#pragma once

#include "network/http/furlhttphandler.h"

/// Gets what a URL of the protocol "https" names, as its base does for "http", but encrypted.
///
/// A server is trusted only where its certificate is for the URL's host and goes back to one of the application's
/// "Resources/cacert.pem". A proxy gets to see host and port alone. Redirections to "http" are not followed, which
/// would take the encryption away unseen. Threads as in its base.
class FUrlHttpsHandler : public FUrlHttpHandler
{
    DECLARE_TYPE(FUrlHttpsHandler, FUrlHttpHandler)

    static constexpr uint16 kPort = 443;

    using FUrlHttpHandler::FUrlHttpHandler;

protected:
    const char* getOwnProtocol() const override { return "https"; }
    uint16 getDefaultPort() const override { return kPort; }
    FUrlStream* newStream() override;
    Next connect(const HttpProxy& proxy) override;
    void makeRequest(HttpRequest& request, const HttpProxy& proxy) override;

private:
    Next openTunnel(const HttpProxy& proxy);
};

FUrlHandler* createUrlHttpsHandler(FUrl& url);
/// Registers the handler; once at start.
void initFUrlHttpsHandler();
