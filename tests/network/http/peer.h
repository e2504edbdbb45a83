#pragma once

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
        /// Whether the connection stays open until the peer goes.
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

    int port() const { return number; }
    /// "http://127.0.0.1:<port>" and the rest.
    std::string url(const std::string& rest = "/") const;
    /// All requests that were read whole.
    std::vector<std::string> requests() const;
    void waitForRequest() const;

private:
    void serve();
    void answer(int connection);
    bool readRequest(int connection, std::string& request) const;
    bool awaitInput(int handle) const;

    Script script;
    int listener = -1;
    // Readable once the peer is to end.
    int endPipe[2] = {-1, -1};
    int number = 0;
    mutable std::mutex mutex;
    std::vector<std::string> received;
    std::thread thread;
};

/// A port of the loopback interface that was free a moment ago.
int freePort();
/// Whether somebody listens there.
bool isServed(int port);
