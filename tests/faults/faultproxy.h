#pragma once

#include <memory>
#include <string>
#include <vector>

/// What the proxy does to one connection, once so many bytes have passed in one direction.
///
///     delay   waits a moment before each block
///     single  passes one byte at a time
///     cut     closes both ways
///     reset   the same, with a reset
///     half    closes this direction only; nothing more of it passes
///     stall   passes nothing more of this direction until released
struct NetworkFault
{
    enum class Kind
    {
        none,
        delay,
        single,
        cut,
        reset,
        half,
        stall
    };

    Kind kind = Kind::none;
    /// Of the bytes from the service, else of those to it.
    bool isReply = false;
    long byte = 0;
};

const char* nameOf(NetworkFault::Kind kind);

/// A proxy on the loopback interface that passes connections on and spoils them as planned. It sees only bytes: what
/// they mean is encrypted.
///
/// A thread takes the connections, another each direction of each of them. Thread-safe.
class FaultProxy
{
public:
    /// `port` is that of the service, on the same interface.
    explicit FaultProxy(int port);
    /// Ends all connections and waits for its threads.
    ~FaultProxy();

    FaultProxy(const FaultProxy&) = delete;
    FaultProxy& operator=(const FaultProxy&) = delete;

    /// "127.0.0.1:" and its port.
    std::string host() const;

    /// The fault of each connection from now on, in their order; those behind the last have none.
    void plan(std::vector<NetworkFault> faults);
    /// Lets go on what stalls.
    void release();
    /// Waits until so many directions stall; false if that lasts as long as a hang.
    bool waitForStalled(int count = 1) const;

    /// The bytes that passed, by connection since the last plan.
    struct Passed
    {
        long sent = 0;
        long replied = 0;
    };
    std::vector<Passed> passed() const;

private:
    class State;

    std::unique_ptr<State> state;
};
