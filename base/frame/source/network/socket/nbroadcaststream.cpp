#include "network/socket/nbroadcaststream.h"

#include "network/socket/naddresslookup.h"

bool NBroadcastStream::open(uint16 port)
{
    socket->disconnect();
    resetReading();
    remotePort = port;
    return receiving ? socket->bind(port) : socket->setBroadcast(true);
}

int64 NBroadcastStream::writeRaw(const void* data, int64 count)
{
    if (receiving || count > kMaxDatagram)
        return kSocketFailed;
    int64 result = kSocketFailed;
    for (const NAddress& address : NAddressLookup::getBroadcastAddresses())
    {
        const int sent =
            socket->sendDataTo(address, remotePort, static_cast<const char*>(data), static_cast<int>(count));
        if (sent == count)
            result = count;
    }
    return result;
}
