#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/text/fstring.h"
#include "network/socket/nsocket.h"

class NStream;

/// Waits for TCP connections on a port.
///
/// One thread at a time, but for `stop`, which any thread may call.
class NServer : public CmObject
{
    DECLARE_TYPE(NServer, CmObject)

    /// Port 0 takes a free one, which `getLocalPort` tells after `open`. `backlog` connections wait to be taken.
    NServer(uint16 serverPort, int serverBacklog);
    NServer(const NServer&) = delete;
    NServer& operator=(const NServer&) = delete;
    ~NServer() override;
    CmObject* newCopy() const override { return nullptr; }

    /// Serves at this address of the host alone; "a.b.c.d", before `open`. False where that is no address.
    bool setAddress(const char* address);
    /// Begins to listen. `waitForConnection` waits at most `timeout` milliseconds; -1 is without limit.
    bool open(int timeout = -1);
    /// The next connection; the caller gets the reference. Null when the time is over or the server was stopped.
    NStream* waitForConnection();
    /// Ends the wait; the server stays stopped until it is opened anew. Any thread.
    void stop();
    /// Ends listening.
    void close();
    bool isOpen() const { return socket.getState() == NSocket::kListening; }

    uint16 getLocalPort() const;
    /// The name of this host.
    void getHostName(String& name) const;
    /// The address that is served: the one that was set, else the first of this host's.
    void getIPAddress(String& address) const;
    NSocket& getSocket() { return socket; }

private:
    NSocket socket{NSocket::kStream};
    uint16 port;
    int backlog;
    int waitLimit = -1;
};
