#include "tests/network/http/peer.h"

#include "tests/job/process.h"

#include <gtest/gtest.h>

#include <algorithm>

namespace
{
constexpr const char* kLoopback = "127.0.0.1";
}

Peer::Peer(Script peerScript) : script(std::move(peerScript))
{
    EXPECT_TRUE(server.setAddress(kLoopback) && server.open());
    thread = std::thread([this] { serve(); });
}

Peer::Peer(std::vector<std::string> answers)
    : Peer([answers](const std::string&, size_t index)
           { return Answer{answers[std::min(index, answers.size() - 1)]}; })
{
}

Peer::~Peer()
{
    server.stop();
    {
        std::lock_guard<std::mutex> guard(mutex);
        isEnding = true;
        if (current)
            current->cancel();
    }
    thread.join();
}

std::string Peer::url(const std::string& rest) const
{
    return std::string("http://") + kLoopback + ":" + std::to_string(port()) + rest;
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

void Peer::serve()
{
    while (const auto connection = adopt(server.waitForConnection()))
    {
        {
            std::lock_guard<std::mutex> guard(mutex);
            if (isEnding)
                return;
            current = connection;
        }
        answer(*connection);
        std::lock_guard<std::mutex> guard(mutex);
        current = nullptr;
    }
}

void Peer::answer(NStream& connection)
{
    std::string request;
    char c = 0;
    while (!request.ends_with("\r\n\r\n"))
    {
        if (connection.readRaw(&c, 1) != 1)
            return;
        request += c;
    }
    size_t index = 0;
    {
        std::lock_guard<std::mutex> guard(mutex);
        index = received.size();
        received.push_back(request);
    }
    const Answer given = script(request, index);
    connection.writeRaw(given.bytes.data(), static_cast<int64>(given.bytes.size()));
    while (given.isHeld && connection.readRaw(&c, 1) == 1)
        continue;
}

int freePort()
{
    NServer server(0, 1);
    EXPECT_TRUE(server.setAddress(kLoopback) && server.open());
    return server.getLocalPort();
}

bool isServed(int port)
{
    const auto stream = adopt(new NStream);
    return stream->open(kLoopback, static_cast<uint16>(port), 0);
}
