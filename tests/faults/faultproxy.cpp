#include "tests/faults/faultproxy.h"

#include "tests/job/process.h"

#include <algorithm>
#include <atomic>
#include <chrono>
#include <cstring>
#include <list>
#include <mutex>
#include <stdexcept>
#include <thread>

#include <arpa/inet.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

namespace
{
constexpr int kPollMs = 20;
constexpr std::chrono::milliseconds kDelay{15};

sockaddr_in addressOf(int port)
{
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    address.sin_port = htons(static_cast<std::uint16_t>(port));
    return address;
}

int makeListener()
{
    const int listener = socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
    const sockaddr_in address = addressOf(0);
    if (bind(listener, reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0 ||
        listen(listener, 16) != 0)
        throw std::runtime_error("the proxy cannot listen");
    return listener;
}

int portOf(int listener)
{
    sockaddr_in address = {};
    socklen_t size = sizeof address;
    getsockname(listener, reinterpret_cast<sockaddr*>(&address), &size);
    return ntohs(address.sin_port);
}

bool isReadable(int descriptor)
{
    pollfd ready = {descriptor, POLLIN, 0};
    return poll(&ready, 1, kPollMs) > 0;
}

bool sendAll(int descriptor, const char* bytes, long count)
{
    while (count > 0)
    {
        const ssize_t sent = send(descriptor, bytes, static_cast<std::size_t>(count), MSG_NOSIGNAL);
        if (sent <= 0)
            return false;
        bytes += sent;
        count -= sent;
    }
    return true;
}
} // namespace

const char* nameOf(NetworkFault::Kind kind)
{
    constexpr const char* kNames[] = {"none", "delay", "single", "cut", "reset", "half", "stall"};
    return kNames[static_cast<int>(kind)];
}

/// Two sockets and what is to happen between them. The sockets are shut by any thread, closed when both have ended.
struct Connection
{
    ~Connection()
    {
        for (std::thread* thread : {&sending, &replying})
            if (thread->joinable())
                thread->join();
        for (const int descriptor : {client, service})
            if (descriptor >= 0)
                close(descriptor);
    }

    void cut() const
    {
        shutdown(client, SHUT_RDWR);
        shutdown(service, SHUT_RDWR);
    }

    // A reset goes out only when the last descriptor is closed; the other side of the pair sees the end of the stream.
    void reset()
    {
        const linger hard = {1, 0};
        for (const int descriptor : {client, service})
        {
            setsockopt(descriptor, SOL_SOCKET, SO_LINGER, &hard, sizeof hard);
            // Disconnecting aborts, and keeps the descriptor for the other thread.
            sockaddr none = {};
            none.sa_family = AF_UNSPEC;
            connect(descriptor, &none, sizeof none);
        }
    }

    int client = -1;
    int service = -1;
    NetworkFault fault;
    std::atomic<long> sent{0};
    std::atomic<long> replied{0};
    std::atomic<bool> isOver{false}; ///< what stalled goes on
    std::thread sending;
    std::thread replying;
};

class FaultProxy::State
{
public:
    explicit State(int servicePort) : listener(makeListener()), port(servicePort)
    {
        accepting = std::thread([this] { acceptAll(); });
    }

    ~State()
    {
        isEnding = true;
        accepting.join();
        for (Connection& connection : connections)
            connection.cut();
        connections.clear();
        close(listener);
    }

    void acceptAll()
    {
        while (!isEnding)
        {
            const int client = isReadable(listener) ? accept4(listener, nullptr, nullptr, SOCK_CLOEXEC) : -1;
            if (client >= 0)
                begin(client);
        }
    }

    void begin(int client)
    {
        const sockaddr_in address = addressOf(port);
        const std::lock_guard guard(lock);
        Connection& connection = connections.emplace_back();
        connection.client = client;
        connection.service = socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
        const int at = index++;
        if (at < static_cast<int>(faults.size()))
            connection.fault = faults[static_cast<std::size_t>(at)];
        const int on = 1;
        for (const int descriptor : {connection.client, connection.service})
            setsockopt(descriptor, IPPROTO_TCP, TCP_NODELAY, &on, sizeof on);
        if (connect(connection.service, reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0)
        {
            connection.cut();
            return;
        }
        connection.sending = std::thread([this, &connection] { pass(connection, false); });
        connection.replying = std::thread([this, &connection] { pass(connection, true); });
    }

    /// One direction to its end.
    void pass(Connection& connection, bool isReply)
    {
        const int from = isReply ? connection.service : connection.client;
        const int to = isReply ? connection.client : connection.service;
        std::atomic<long>& done = isReply ? connection.replied : connection.sent;
        char block[16384];
        while (!isEnding)
        {
            if (!isReadable(from))
                continue;
            const ssize_t count = recv(from, block, sizeof block, 0);
            if (count <= 0 || !passBlock(connection, isReply, to, block, count, done))
                break;
        }
        shutdown(to, SHUT_WR);
    }

    /// False where nothing more is to pass in this direction.
    bool passBlock(Connection& connection, bool isReply, int to, const char* block, long count,
                   std::atomic<long>& done)
    {
        using Kind = NetworkFault::Kind;
        const NetworkFault& fault = connection.fault;
        const bool isMeant = fault.kind != Kind::none && fault.isReply == isReply && !connection.isOver;
        if (isMeant && fault.kind == Kind::delay)
            std::this_thread::sleep_for(kDelay);
        if (isMeant && fault.kind == Kind::single)
            return passSingly(to, block, count, done);
        const long until = fault.byte - done;
        const bool isDue = isMeant && fault.kind != Kind::delay && until <= count;
        const long first = isDue ? std::max(until, 0L) : count;
        if (!sendAll(to, block, first))
            return false;
        done += first;
        return !isDue || (strike(connection) && sendAll(to, block + first, count - first) &&
                          (done += count - first, true));
    }

    static bool passSingly(int to, const char* block, long count, std::atomic<long>& done)
    {
        for (long i = 0; i < count; i++, done++)
            if (!sendAll(to, block + i, 1))
                return false;
        return true;
    }

    /// True where the direction goes on.
    bool strike(Connection& connection)
    {
        switch (connection.fault.kind)
        {
        case NetworkFault::Kind::stall:
            stall();
            connection.isOver = true;
            return !isEnding;
        case NetworkFault::Kind::reset:
            connection.reset();
            return false;
        case NetworkFault::Kind::half:
            return false;
        default:
            connection.cut();
            return false;
        }
    }

    void stall()
    {
        stalled++;
        while (!isReleased && !isEnding)
            pauseBriefly();
        stalled--;
    }

    const int listener;
    const int port;
    std::atomic<bool> isEnding{false};
    std::atomic<bool> isReleased{false};
    std::atomic<int> stalled{0};
    mutable std::mutex lock;
    // Under the lock
    std::vector<NetworkFault> faults;
    std::list<Connection> connections;
    int index = 0;
    std::thread accepting;
};

FaultProxy::FaultProxy(int port) : state(std::make_unique<State>(port)) {}

FaultProxy::~FaultProxy() = default;

std::string FaultProxy::host() const
{
    return "127.0.0.1:" + std::to_string(portOf(state->listener));
}

void FaultProxy::plan(std::vector<NetworkFault> faults)
{
    std::list<Connection> former;
    {
        const std::lock_guard guard(state->lock);
        former.swap(state->connections);
        state->faults = std::move(faults);
        state->index = 0;
        state->isReleased = false;
    }
    for (const Connection& connection : former)
        connection.cut();
}

void FaultProxy::release()
{
    state->isReleased = true;
}

bool FaultProxy::waitForStalled(int count) const
{
    return waitUntil([&] { return state->stalled >= count; });
}

std::vector<FaultProxy::Passed> FaultProxy::passed() const
{
    const std::lock_guard guard(state->lock);
    std::vector<Passed> result;
    for (const Connection& connection : state->connections)
        result.push_back({connection.sent, connection.replied});
    return result;
}
