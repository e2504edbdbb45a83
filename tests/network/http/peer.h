#pragma once

#include "foundation/object/iptr.h"
#include "network/socket/nserver.h"
#include "network/socket/nstream.h"

#include <functional>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

/// A server on a loopback port that answers each connection as a test wants it, without minding HTTP.
///
/// It reads up to a blank line, sends the answer and closes. Its destructor ends the connection at hand.
class Peer
{
public:
    struct Answer
    {
        std::string bytes;
        /// Whether the connection stays open until the other side or the peer goes.
        bool isHeld = false;
    };
    /// Called by the server's thread with the request and how many came before it.
    using Script = std::function<Answer(const std::string& request, size_t number)>;

    explicit Peer(Script peerScript);
    /// Gives these answers in turn, and the last one again and again.
    explicit Peer(std::vector<std::string> answers);
    ~Peer();
    Peer(const Peer&) = delete;
    Peer& operator=(const Peer&) = delete;

    int port() const { return server.getLocalPort(); }
    /// "http://127.0.0.1:<port>" and the rest.
    std::string url(const std::string& rest = "/") const;
    /// All requests that were read whole.
    std::vector<std::string> requests() const;
    void waitForRequest() const;

private:
    void serve();
    void answer(NStream& connection);

    Script script;
    NServer server{0, 16};
    mutable std::mutex mutex;
    std::vector<std::string> received;
    IPtr<NStream> current;
    bool isEnding = false;
    std::thread thread;
};

/// A port of the loopback interface that was free a moment ago.
int freePort();
/// Whether somebody listens there.
bool isServed(int port);
