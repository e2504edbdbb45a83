#include "network/socket/platformsocket.h"

#include <algorithm>
#include <climits>
#include <cstring>
#include <memory>

#include <ifaddrs.h>
#include <net/if.h>
#include <netdb.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>

namespace
{
NAddress addressOf(const sockaddr* system)
{
    NAddress result;
    sockaddr_in internet{};
    memcpy(&internet, system, sizeof internet);
    memcpy(result.bytes, &internet.sin_addr, NAddress::kSize);
    return result;
}

void addOnce(std::vector<NAddress>& addresses, const NAddress& address)
{
    if (std::find(addresses.begin(), addresses.end(), address) == addresses.end())
        addresses.push_back(address);
}

/// Calls `visit` for each interface that is up and has an IPv4 address.
template <class Visit>
void visitInterfaces(Visit visit)
{
    ifaddrs* first = nullptr;
    if (getifaddrs(&first) != 0)
        return;
    for (const ifaddrs* entry = first; entry; entry = entry->ifa_next)
        if (entry->ifa_addr && entry->ifa_addr->sa_family == AF_INET && (entry->ifa_flags & IFF_UP))
            visit(*entry);
    freeifaddrs(first);
}
} // namespace

std::vector<NAddress> PlatformSocket::localAddresses()
{
    std::vector<NAddress> result;
    visitInterfaces([&](const ifaddrs& entry) { addOnce(result, addressOf(entry.ifa_addr)); });
    return result;
}

std::vector<NAddress> PlatformSocket::broadcastAddresses()
{
    std::vector<NAddress> result;
    visitInterfaces(
        [&](const ifaddrs& entry)
        {
            if (entry.ifa_flags & IFF_BROADCAST && entry.ifa_broadaddr)
                addOnce(result, addressOf(entry.ifa_broadaddr));
        });
    return result;
}

std::string PlatformSocket::localHostName()
{
    char name[HOST_NAME_MAX + 1] = {};
    return gethostname(name, sizeof name - 1) == 0 ? name : "";
}

std::vector<NAddress> PlatformSocket::findHost(const std::string& host)
{
    addrinfo hints{};
    hints.ai_family = AF_INET;
    hints.ai_socktype = SOCK_STREAM;
    addrinfo* first = nullptr;
    if (getaddrinfo(host.c_str(), nullptr, &hints, &first) != 0)
        return {};
    std::vector<NAddress> result;
    for (const addrinfo* entry = first; entry; entry = entry->ai_next)
        addOnce(result, addressOf(entry->ai_addr));
    freeaddrinfo(first);
    return result;
}

std::string PlatformSocket::findName(const NAddress& address)
{
    sockaddr_in system{};
    system.sin_family = AF_INET;
    memcpy(&system.sin_addr, address.bytes, NAddress::kSize);
    char name[NI_MAXHOST] = {};
    const int error = getnameinfo(reinterpret_cast<const sockaddr*>(&system), sizeof system, name,
                                  sizeof name, nullptr, 0, NI_NAMEREQD);
    return error == 0 ? name : "";
}
