#include "network/socket/naddresslookup.h"

#include "containers/sequence/cmcontainer.h"
#include "foundation/text/cmstring.h"
#include "network/socket/nhostsearch.h"
#include "network/socket/platformsocket.h"

#include <algorithm>

int NAddressLookup::getLocalAddresses(CmContainer& result, bool withLoopback)
{
    int count = 0;
    for (const NAddress& address : PlatformSocket::localAddresses())
    {
        if (address.isLoopback() && !withLoopback)
            continue;
        auto* text = new CmString;
        address.toText(*text);
        result.add(text);
        count++;
    }
    return count;
}

bool NAddressLookup::isLocalAddress(const NAddress& address)
{
    const std::vector<NAddress> all = PlatformSocket::localAddresses();
    return address.isLoopback() || std::find(all.begin(), all.end(), address) != all.end();
}

NAddress NAddressLookup::getLocalAddress()
{
    for (const NAddress& address : PlatformSocket::localAddresses())
        if (!address.isLoopback())
            return address;
    return kLoopbackAddress;
}

std::vector<NAddress> NAddressLookup::getBroadcastAddresses()
{
    return PlatformSocket::broadcastAddresses();
}

bool NAddressLookup::getLocalHostName(String& name)
{
    name.assign(PlatformSocket::localHostName().c_str());
    return !name.isEmpty();
}

std::vector<NAddress> NAddressLookup::findHost(const char* host, int timeout, const NSocket* canceller)
{
    NAddress address;
    if (address.fromText(host))
        return {address};
    if (!host || !*host)
        return {};
    NHostSearch search(host);
    return search.wait(timeout, canceller) ? search.getAddresses() : std::vector<NAddress>();
}

bool NAddressLookup::findName(const NAddress& address, String& name, int timeout, const NSocket* canceller)
{
    NHostSearch search(address);
    name.assign(search.wait(timeout, canceller) ? search.getName().c_str() : "");
    return !name.isEmpty();
}
