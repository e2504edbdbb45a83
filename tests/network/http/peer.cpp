#include "tests/network/http/peer.h"

#include "tests/job/process.h"

#include <gtest/gtest.h>

#include <algorithm>

#include <arpa/inet.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

namespace
{
sockaddr_in loopback(int port)
{
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_port = htons(static_cast<uint16_t>(port));
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    return address;
}

int makeSocket()
{
    return socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
}

/// Binds to a port that the system chooses, and gives it.
int bindAnywhere(int handle)
{
    sockaddr_in address = loopback(0);
    socklen_t size = sizeof address;
    EXPECT_EQ(bind(handle, reinterpret_cast<sockaddr*>(&address), size), 0);
    EXPECT_EQ(getsockname(handle, reinterpret_cast<sockaddr*>(&address), &size), 0);
    return ntohs(address.sin_port);
}
} // namespace

Peer::Peer(Script peerScript) : script(std::move(peerScript)), listener(makeSocket())
{
    number = bindAnywhere(listener);
    EXPECT_EQ(listen(listener, 16), 0);
    EXPECT_EQ(pipe(endPipe), 0);
    thread = std::thread([this] { serve(); });
}

Peer::Peer(std::vector<std::string> answers)
    : Peer([answers](const std::string&, size_t index)
           { return Answer{answers[std::min(index, answers.size() - 1)]}; })
{
}

Peer::~Peer()
{
    EXPECT_EQ(write(endPipe[1], "x", 1), 1);
    thread.join();
    for (const int handle : {listener, endPipe[0], endPipe[1]})
        close(handle);
}

std::string Peer::url(const std::string& rest) const
{
    return "http://127.0.0.1:" + std::to_string(number) + rest;
}

std::vector<std::string> Peer::requests() const
{
    std::lock_guard<std::mutex> guard(mutex);
    return received;
}

void Peer::waitForRequest() const
{
    EXPECT_TRUE(waitUntil([this] { return !requests().empty(); })) << "nobody asks";
}

bool Peer::awaitInput(int handle) const
{
    pollfd waited[] = {{handle, POLLIN, 0}, {endPipe[0], POLLIN, 0}};
    poll(waited, 2, -1);
    return waited[1].revents == 0;
}

void Peer::serve()
{
    while (awaitInput(listener))
    {
        const int connection = accept(listener, nullptr, nullptr);
        answer(connection);
        close(connection);
    }
}

void Peer::answer(int connection)
{
    std::string request;
    if (!readRequest(connection, request))
        return;
    size_t index = 0;
    {
        std::lock_guard<std::mutex> guard(mutex);
        index = received.size();
        received.push_back(request);
    }
    const Answer given = script(request, index);
    for (size_t sent = 0; sent < given.bytes.size();)
    {
        const ssize_t count =
            send(connection, given.bytes.data() + sent, given.bytes.size() - sent, MSG_NOSIGNAL);
        if (count <= 0)
            return;
        sent += static_cast<size_t>(count);
    }
    char rest = 0;
    // Only the other side's end or that of this peer ends it.
    while (given.isHeld && awaitInput(connection) && recv(connection, &rest, 1, 0) > 0)
        continue;
}

bool Peer::readRequest(int connection, std::string& request) const
{
    char c = 0;
    while (!request.ends_with("\r\n\r\n"))
    {
        if (!awaitInput(connection) || recv(connection, &c, 1, 0) != 1)
            return false;
        request += c;
    }
    return true;
}

int freePort()
{
    const int handle = makeSocket();
    const int port = bindAnywhere(handle);
    close(handle);
    return port;
}

bool isServed(int port)
{
    const int handle = makeSocket();
    const sockaddr_in address = loopback(port);
    const bool isConnected =
        connect(handle, reinterpret_cast<const sockaddr*>(&address), sizeof address) == 0;
    close(handle);
    return isConnected;
}
