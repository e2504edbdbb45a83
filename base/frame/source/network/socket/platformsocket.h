#pragma once

#include "network/socket/nsocket.h"

#include <string>
#include <vector>

/// The system's sockets, none of which ever blocks, and what it knows of hosts.
///
/// Handles are those of the system; -1 is none. Errors are told by results alone. Defined by the platform.
/// *Thread-safe*, as far as the system's sockets are.
class PlatformSocket
{
public:
    enum Option
    {
        kBroadcast,
        kNoDelay,
        kSendBuffer,
        kReceiveBuffer
    };

    /// One of the sockets of a wait.
    struct Wait
    {
        int handle;
        PendingQuery query;
        bool isReady;
    };

    /// The socket can be bound to a port that was in use, and for datagrams to one that others are bound to.
    static int create(NSocket::Type type);
    static void close(int handle);
    static bool bind(int handle, const NAddress& address, uint16 port);
    static bool listen(int handle, int backlog);
    /// A handle, `kSocketFailed` or `kSocketWouldBlock`.
    static int accept(int handle, NAddress& address);
    /// 0 when connected, or one of the two; after `kSocketWouldBlock` the end shows as room to send.
    static int connect(int handle, const NAddress& address, uint16 port);
    static bool isConnected(int handle);
    static bool endSending(int handle);

    /// As the operations of NSocket in non-blocking mode. A null address is that of the connection.
    static int send(int handle, const char* data, int size, const NAddress* address, uint16 port);
    static int receive(int handle, char* data, int size, NAddress* address, uint16* port);

    static bool getPeer(int handle, NAddress& address, uint16& port);
    static bool getLocal(int handle, NAddress& address, uint16& port);
    static bool setOption(int handle, Option option, int value);
    static int getOption(int handle, Option option);

    // Waiting

    /// A handle that a wait can be ended by, from `wake` until `clearWake`.
    static int createWake();
    static void wake(int wakeHandle);
    static void clearWake(int wakeHandle);
    /// Waits at most `timeout` milliseconds, -1 without limit, until a socket is ready, and marks those that are.
    /// False when the time is over or a wait was ended.
    static bool wait(std::vector<Wait>& sockets, const std::vector<int>& wakeHandles, int timeout);

    // Hosts

    static std::vector<NAddress> localAddresses();
    static std::vector<NAddress> broadcastAddresses();
    static std::string localHostName();
    /// These two may take many seconds.
    static std::vector<NAddress> findHost(const std::string& host);
    static std::string findName(const NAddress& address);
};
