#pragma once

#include "foundation/object/types.h"

#include <memory>

class FString;

/// What carries the encrypted bytes of a TLS session. Results as those of NStream's hooks: at least one byte, 0 at the
/// end, negative on failure.
class TlsTransport
{
public:
    virtual int receive(char* data, int size) = 0;
    virtual int send(const char* data, int size) = 0;

protected:
    ~TlsTransport() = default;
};

/// One side of an encrypted connection, that of the client. The platform answers. One thread at a time.
class TlsSession
{
public:
    virtual ~TlsSession() = default;

    /// Whether the library of the platform could be set up. Where memory was short for that, it can't be used by
    /// anybody in this process.
    static bool isAvailable();

    /// Greets the server, and trusts it only if its certificate is for `host`, holds today, and goes back to one of
    /// those in the file `certificateFile` (PEM). Null where it isn't to be trusted or the transport fails, which is
    /// borrowed and outlives the session.
    static std::unique_ptr<TlsSession> start(TlsTransport& transport, const FString& host,
                                             const FString& certificateFile);

    /// At least one byte; 0 where the server said that nothing more comes; negative on failure, also where the
    /// connection ends without that word.
    virtual int read(char* data, int size) = 0;
    /// At least one byte; negative on failure.
    virtual int write(const char* data, int size) = 0;
    /// Says goodbye, without waiting for an answer.
    virtual void end() = 0;
};
