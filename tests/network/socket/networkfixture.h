#pragma once

#include "foundation/object/iptr.h"
#include "network/socket/nserver.h"
#include "network/socket/nstream.h"

#include <functional>
#include <thread>

/// A thread that a test joins at its end, whatever happens in between.
class Background
{
public:
    explicit Background(std::function<void()> work) : thread(std::move(work)) {}
    ~Background() { join(); }

    void join()
    {
        if (thread.joinable())
            thread.join();
    }

private:
    std::thread thread;
};

/// Two ends of a connection over the loopback interface.
struct Connection
{
    Connection()
    {
        server.setAddress("127.0.0.1");
        if (server.open() && client.open("127.0.0.1", server.getLocalPort(), 10))
            accepted = adopt(server.waitForConnection());
    }

    bool isUp() const { return accepted != nullptr; }

    NServer server{0, 4};
    NStream client;
    IPtr<NStream> accepted;
};
