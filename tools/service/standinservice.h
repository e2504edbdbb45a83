#pragma once

#include "tools/service/behaviour.h"
#include "tools/service/certificates.h"
#include "tools/service/receivedrequest.h"

#include <chrono>
#include <memory>
#include <string>
#include <vector>

/// A stand-in of the upload service: HTTPS on 127.0.0.1, everything in memory.
///
/// It knows `/me`, `/tracks`, `/connect`, and the edit page of each track it took. A track's text fields are
/// kept, its files only counted and digested. Each request meets the next behaviour planned for its path;
/// without one it is answered well. Thread-safe.
class StandInService
{
public:
    /// What the service shows when it is asked who it is.
    enum class Identity
    {
        honest,
        otherHost,
        expired,
        otherAuthority
    };

    struct Options
    {
        /// 0 picks a free one.
        int port = 0;
        /// The only token that is accepted, and the one that a login gives.
        std::string token = "1-20120314-4711-StandInToken~.";
        Identity identity = Identity::honest;
    };

    /// The authority must outlive the service.
    StandInService(const CertificateAuthority& authority, Options options);
    ~StandInService();

    StandInService(const StandInService&) = delete;
    StandInService& operator=(const StandInService&) = delete;

    /// Begins to listen; false if the port cannot be had. All else may be called before.
    bool start();

    /// Releases what is stalled, ends the connections and waits for them.
    void stop();

    /// "127.0.0.1:" and the port.
    std::string host() const;
    const std::string& token() const;

    /// Adds a behaviour for the next request of `path` that has none yet: "/me", "/tracks" or "/connect".
    void plan(const std::string& path, const Behaviour& behaviour);
    /// The same from a line such as "/tracks stall 4096"; false if that is no such line.
    bool plan(const std::string& line);

    /// Lets everything go on that stalls now.
    void release();

    std::vector<ReceivedRequest> received() const;

    /// Waits until `count` requests stall at once; false if they do not within the time.
    bool waitForStalled(int count, std::chrono::milliseconds time) const;
    /// Waits until `count` requests of `path` have begun.
    bool waitForRequests(const std::string& path, int count, std::chrono::milliseconds time) const;
    int stalled() const;

private:
    class Listener;
    class State;

    std::unique_ptr<State> state;
    std::unique_ptr<Listener> listener;
};
