#pragma once

#include "network/socket/platformsocket.h"

#include <vector>

/// Waits for several sockets at once. The sockets are borrowed, and must live until the wait is over.
/// *One thread at a time*.
class NSocketPoll
{
public:
    /// Gives the number by which the socket is asked for after the wait.
    int add(const NSocket& socket, PendingQuery query);
    /// A stop of this socket ends the wait, too.
    void addCanceller(const NSocket& socket);
    /// Waits at most `timeout` milliseconds, -1 without limit, until one of the sockets is ready. False when the time
    /// is over or one of them was stopped.
    bool wait(int timeout);
    bool isReady(int index) const { return sockets[static_cast<size_t>(index)].isReady; }
    void clear();

private:
    std::vector<PlatformSocket::Wait> sockets;
    std::vector<int> wakeHandles;
};
