#pragma once

#include "foundation/object/cmobject.h"
#include "network/socket/nsocket.h"

class NStream;
class String;

/// Waits for TCP connections on a port.
///
/// One thread at a time, but for `stop`.
class NServer : public CmObject
{
    DECLARE_TYPE(NServer, CmObject)

    /// Port 0 takes a free one, which `getLocalPort` tells after `open`. `backlog` connections wait to be taken.
    NServer(uint16 serverPort, int serverBacklog);
    NServer(const NServer&) = delete;
    NServer& operator=(const NServer&) = delete;
    CmObject* newCopy() const override { return nullptr; }

    /// Serves at this address of the host alone: "a.b.c.d", before `open`. False where that is no address.
    bool setAddress(const char* address);
    /// Begins to listen; false where the port can't be had. `waitForConnection` waits at most `timeout`
    /// milliseconds, -1 without limit.
    bool open(int timeout = -1);
    /// The next connection; the caller gets the reference. Null when the time is over, the server was stopped, or the
    /// process has no room for another connection.
    NStream* waitForConnection();
    /// Ends the wait; the server stays stopped until it is opened anew. Any thread.
    void stop();
    /// Ends listening.
    void close();
    bool isOpen() const { return socket.getState() == NSocket::kListening; }
    bool isStopped() const { return socket.isStopped(); }

    /// The one that it listens on, else the one to be opened.
    uint16 getLocalPort() const;
    /// The name of this host.
    void getHostName(String& name) const;
    /// The address that was set, else the first that other hosts know.
    void getIPAddress(String& address) const;
    const NSocket& getSocket() const { return socket; }

protected:
    /// What a connection is handed out as.
    virtual NStream* makeStream(std::unique_ptr<NSocket> connection);

private:
    NSocket socket{NSocket::kStream};
    uint16 port;
    int backlog;
};
