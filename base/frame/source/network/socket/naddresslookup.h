#pragma once

#include "network/socket/naddress.h"

#include <vector>

class CmContainer;
class NSocket;
class String;

/// Names and addresses of hosts. *Thread-safe*.
class NAddressLookup
{
public:
    /// Adds the addresses of this host as CmString objects "a.b.c.d", which the container must own. Those of the
    /// loopback interface only with `withLoopback`. Returns how many were added.
    static int getLocalAddresses(CmContainer& result, bool withLoopback = false);
    static bool isLocalAddress(const NAddress& address);
    /// The first address that other hosts know; that of the loopback interface where there is none.
    static NAddress getLocalAddress();
    /// Where datagrams to everyone go: one address for each local network.
    static std::vector<NAddress> getBroadcastAddresses();
    /// The name of this host; false, and an empty text, where it has none.
    static bool getLocalHostName(String& name);

    // What asks other hosts, which may take many seconds. It is given up after `timeout` milliseconds (-1 is without
    // limit), or soon after `canceller`, which may be null, is stopped

    /// An address in numbers, which takes no asking, or the addresses of a name in the order to try them. Empty where
    /// there are none.
    static std::vector<NAddress> findHost(const char* host, int timeout = -1,
                                          const NSocket* canceller = nullptr);
    /// The name of a host; false where it isn't known.
    static bool findName(const NAddress& address, String& name, int timeout = -1,
                         const NSocket* canceller = nullptr);
};
