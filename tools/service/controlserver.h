#pragma once

#include <memory>
#include <string>

class StandInService;

/// Lets scripts command a stand-in service over plain HTTP on 127.0.0.1.
///
///     GET  /received   what the service received, as lines for people
///     GET  /stalled    how many requests stall
///     POST /plan       body: one behaviour a line, such as "/tracks stall 4096"
///     POST /release    lets everything go on that stalls; its body is empty
///
/// The service must outlive it. *thread-safe*
class ControlServer
{
public:
    explicit ControlServer(StandInService& service);
    ~ControlServer();

    /// False if no port could be had.
    bool start();
    void stop();

    /// "http://127.0.0.1:" and the port.
    std::string address() const;

private:
    class Listener;
    std::unique_ptr<Listener> listener;
};
