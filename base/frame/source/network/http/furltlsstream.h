#pragma once

#include "network/http/furlstream.h"
#include "network/http/tlssession.h"

/// A connection that becomes an encrypted one. One thread at a time, but for `cancel`.
class FUrlTlsStream : public FUrlStream, private TlsTransport
{
    DECLARE_TYPE(FUrlTlsStream, FUrlStream)

    FUrlTlsStream() = default;
    ~FUrlTlsStream() override;

    /// From now on all bytes are encrypted for `host`, with the certificates that the application trusts. False where
    /// the other side isn't that host for certain; nothing but the greeting was sent then.
    bool encrypt(const FString& host);
    bool close() override;

protected:
    int receiveSome(char* data, int size) override;
    int sendSome(const char* data, int size) override;

private:
    int receive(char* data, int size) override;
    int send(const char* data, int size) override;

    std::unique_ptr<TlsSession> session;
};
