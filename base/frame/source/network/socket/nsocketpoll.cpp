#include "network/socket/nsocketpoll.h"

int NSocketPoll::add(const NSocket& socket, PendingQuery query)
{
    sockets.push_back({socket.handle, query, false});
    addCanceller(socket);
    return static_cast<int>(sockets.size()) - 1;
}

void NSocketPoll::addCanceller(const NSocket& socket)
{
    wakeHandles.push_back(socket.wakeHandle);
}

bool NSocketPoll::wait(int timeout)
{
    return PlatformSocket::wait(sockets, wakeHandles, timeout);
}

void NSocketPoll::clear()
{
    sockets.clear();
    wakeHandles.clear();
}
