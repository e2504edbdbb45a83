#include "network/socket/platformsocket.h"

#include <cerrno>
#include <chrono>
#include <cstring>

#include <arpa/inet.h>
#include <fcntl.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <poll.h>
#include <sys/eventfd.h>
#include <sys/socket.h>
#include <unistd.h>

namespace
{
using Clock = std::chrono::steady_clock;

sockaddr_in toSystem(const NAddress& address, uint16 port)
{
    sockaddr_in result{};
    result.sin_family = AF_INET;
    result.sin_port = htons(port);
    memcpy(&result.sin_addr, address.bytes, NAddress::kSize);
    return result;
}

bool fromSystem(const sockaddr_in& system, NAddress& address, uint16& port)
{
    memcpy(address.bytes, &system.sin_addr, NAddress::kSize);
    port = ntohs(system.sin_port);
    return system.sin_family == AF_INET;
}

const sockaddr* generic(const sockaddr_in& address)
{
    return reinterpret_cast<const sockaddr*>(&address);
}

sockaddr* generic(sockaddr_in& address)
{
    return reinterpret_cast<sockaddr*>(&address);
}

int resultOf(ssize_t moved)
{
    if (moved >= 0)
        return static_cast<int>(moved);
    return errno == EAGAIN || errno == EWOULDBLOCK ? kSocketWouldBlock : kSocketFailed;
}

/// Asks again where a signal came in between.
template <class Call>
auto uninterrupted(Call call)
{
    for (;;)
    {
        const auto result = call();
        if (result >= 0 || errno != EINTR)
            return result;
    }
}

struct OptionName
{
    int level;
    int name;
};

OptionName nameOf(PlatformSocket::Option option)
{
    switch (option)
    {
    case PlatformSocket::kBroadcast:
        return {SOL_SOCKET, SO_BROADCAST};
    case PlatformSocket::kNoDelay:
        return {IPPROTO_TCP, TCP_NODELAY};
    case PlatformSocket::kSendBuffer:
        return {SOL_SOCKET, SO_SNDBUF};
    case PlatformSocket::kReceiveBuffer:
        break;
    }
    return {SOL_SOCKET, SO_RCVBUF};
}

/// Milliseconds until `end`, rounded up, so that a wait doesn't end early.
int millisecondsUntil(Clock::time_point end)
{
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(end - Clock::now()).count();
    return left > 0 ? static_cast<int>(left) : 0;
}

int pollFor(std::vector<pollfd>& entries, int timeout)
{
    const auto end = Clock::now() + std::chrono::milliseconds(timeout);
    for (;;)
    {
        const int wait = timeout < 0 ? -1 : millisecondsUntil(end);
        const int count = poll(entries.data(), entries.size(), wait);
        if (count >= 0 || errno != EINTR)
            return count;
    }
}
} // namespace

int PlatformSocket::create(NSocket::Type type)
{
    const int systemType = type == NSocket::kStream ? SOCK_STREAM : SOCK_DGRAM;
    const int handle = socket(AF_INET, systemType | SOCK_NONBLOCK | SOCK_CLOEXEC, 0);
    const int on = 1;
    if (handle >= 0)
        setsockopt(handle, SOL_SOCKET, SO_REUSEADDR, &on, sizeof on);
    return handle;
}

void PlatformSocket::close(int handle)
{
    if (handle >= 0)
        ::close(handle);
}

bool PlatformSocket::bind(int handle, const NAddress& address, uint16 port)
{
    const sockaddr_in system = toSystem(address, port);
    return ::bind(handle, generic(system), sizeof system) == 0;
}

bool PlatformSocket::listen(int handle, int backlog)
{
    return ::listen(handle, backlog) == 0;
}

int PlatformSocket::accept(int handle, NAddress& address)
{
    sockaddr_in system{};
    socklen_t size = sizeof system;
    const int accepted =
        uninterrupted([&] { return accept4(handle, generic(system), &size, SOCK_NONBLOCK | SOCK_CLOEXEC); });
    uint16 port = 0;
    if (accepted >= 0)
        fromSystem(system, address, port);
    // One that was given up by the other side meanwhile is as if it had not come.
    return accepted < 0 && errno == ECONNABORTED ? kSocketWouldBlock : resultOf(accepted);
}

int PlatformSocket::connect(int handle, const NAddress& address, uint16 port)
{
    const sockaddr_in system = toSystem(address, port);
    if (::connect(handle, generic(system), sizeof system) == 0)
        return 0;
    // Interrupted, it goes on in the background.
    return errno == EINPROGRESS || errno == EINTR ? kSocketWouldBlock : kSocketFailed;
}

bool PlatformSocket::isConnected(int handle)
{
    int error = 0;
    socklen_t size = sizeof error;
    return getsockopt(handle, SOL_SOCKET, SO_ERROR, &error, &size) == 0 && error == 0;
}

bool PlatformSocket::endSending(int handle)
{
    return shutdown(handle, SHUT_WR) == 0;
}

int PlatformSocket::send(int handle, const char* data, int size, const NAddress* address, uint16 port)
{
    const auto count = static_cast<size_t>(size);
    const sockaddr_in system = address ? toSystem(*address, port) : sockaddr_in{};
    const socklen_t systemSize = address ? sizeof system : 0;
    return resultOf(uninterrupted(
        [&] {
            return sendto(handle, data, count, MSG_NOSIGNAL, address ? generic(system) : nullptr, systemSize);
        }));
}

int PlatformSocket::receive(int handle, char* data, int size, NAddress* address, uint16* port)
{
    sockaddr_in system{};
    socklen_t systemSize = sizeof system;
    const int result = resultOf(uninterrupted(
        [&] { return recvfrom(handle, data, static_cast<size_t>(size), 0, generic(system), &systemSize); }));
    if (result >= 0 && address && port)
        fromSystem(system, *address, *port);
    return result;
}

bool PlatformSocket::getPeer(int handle, NAddress& address, uint16& port)
{
    sockaddr_in system{};
    socklen_t size = sizeof system;
    return getpeername(handle, generic(system), &size) == 0 && fromSystem(system, address, port);
}

bool PlatformSocket::getLocal(int handle, NAddress& address, uint16& port)
{
    sockaddr_in system{};
    socklen_t size = sizeof system;
    return getsockname(handle, generic(system), &size) == 0 && fromSystem(system, address, port);
}

bool PlatformSocket::setOption(int handle, Option option, int value)
{
    const OptionName name = nameOf(option);
    return setsockopt(handle, name.level, name.name, &value, sizeof value) == 0;
}

int PlatformSocket::getOption(int handle, Option option)
{
    const OptionName name = nameOf(option);
    int value = 0;
    socklen_t size = sizeof value;
    return getsockopt(handle, name.level, name.name, &value, &size) == 0 ? value : 0;
}

// Waiting

int PlatformSocket::createWake()
{
    return eventfd(0, EFD_NONBLOCK | EFD_CLOEXEC);
}

void PlatformSocket::wake(int wakeHandle)
{
    // It fails only where it has been woken more often than can be counted.
    [[maybe_unused]] const int result = eventfd_write(wakeHandle, 1);
}

void PlatformSocket::clearWake(int wakeHandle)
{
    // It fails where there was no wake, which is as good.
    eventfd_t count = 0;
    [[maybe_unused]] const int result = eventfd_read(wakeHandle, &count);
}

bool PlatformSocket::wait(std::vector<Wait>& sockets, const std::vector<int>& wakeHandles, int timeout)
{
    std::vector<pollfd> entries;
    for (const Wait& socket : sockets)
        entries.push_back(
            {socket.handle, static_cast<short>(socket.query == kPendingRead ? POLLIN : POLLOUT), 0});
    for (const int wakeHandle : wakeHandles)
        entries.push_back({wakeHandle, POLLIN, 0});

    const bool isAnyReady = pollFor(entries, timeout) > 0;
    for (size_t i = 0; i < sockets.size(); i++)
        sockets[i].isReady = isAnyReady && entries[i].revents != 0;
    for (size_t i = sockets.size(); i < entries.size(); i++)
        if (entries[i].revents != 0)
            return false;
    return isAnyReady;
}
