#pragma once

#include "foundation/thread/fcondition.h"
#include "foundation/thread/flock.h"
#include "foundation/thread/fthread.h"
#include "network/socket/naddress.h"

#include <memory>
#include <string>
#include <vector>

class NSocket;

/// Asks for a host on a thread of its own, so that the asker can give up.
///
/// The system's search can't be ended; one that was given up runs on by itself and its result is dropped.
/// *One thread at a time*.
class NHostSearch
{
public:
    /// By name.
    explicit NHostSearch(const char* host);
    /// By address.
    explicit NHostSearch(const NAddress& address);
    NHostSearch(const NHostSearch&) = delete;
    NHostSearch& operator=(const NHostSearch&) = delete;

    /// Waits at most `timeout` milliseconds, -1 without limit. False when the time is over or `canceller`, which may
    /// be null, is stopped.
    bool wait(int timeout, const NSocket* canceller);

    // After a successful wait

    const std::vector<NAddress>& getAddresses() const;
    const std::string& getName() const;

private:
    struct Search;
    class SearchThread;

    void start();

    std::shared_ptr<Search> search;
    std::unique_ptr<FThread> thread;
};
