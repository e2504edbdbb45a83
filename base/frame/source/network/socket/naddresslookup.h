#pragma once

#include "network/socket/naddress.h"

#include <vector>

class CmContainer;
class NSocket;
class String;

/// Names and addresses of hosts. Thread-safe.
class NAddressLookup
{
public:
    /// Adds the addresses of this host as CmString objects "a.b.c.d", which the container must own. Those of the
    /// loopback interface only with `withLoopback`. Returns how many were added.
    static int getLocalAddresses(CmContainer& result, bool withLoopback = false);
    static bool isLocalAddress(const NAddress& address);
    /// Where datagrams to everyone go: one address for each local network.
    static std::vector<NAddress> getBroadcastAddresses();
    /// The name of this host; false, and an empty text, where it has none.
    static bool getLocalHostName(String& name);

    // The rest asks other hosts, which may take many seconds.

    /// An address in numbers, or the addresses of a name, in the order to try them; empty where it is not found.
    static std::vector<NAddress> findHost(const char* host);
    /// As above, but gives up after `timeout` milliseconds (-1 is without limit) or when `canceller`, which may be
    /// null, is stopped.
    static std::vector<NAddress> findHost(const char* host, int timeout, NSocket* canceller);
    /// The name of a host; false where it has none.
    static bool findName(const NAddress& address, String& name);
};
