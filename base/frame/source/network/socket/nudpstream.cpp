#include "network/socket/nudpstream.h"

#include <algorithm>

NUDPStream::NUDPStream() : NStream(std::make_unique<NSocket>(NSocket::kDatagram)) {}

int64 NUDPStream::readRaw(void* data, int64 count)
{
    const auto room = static_cast<int>(std::min(count, kMaxDatagram));
    return socket->receiveDataFrom(remoteAddress, remotePort, static_cast<char*>(data), room);
}

int64 NUDPStream::writeRaw(const void* data, int64 count)
{
    if (count > kMaxDatagram)
        return kSocketFailed;
    return socket->sendData(static_cast<const char*>(data), static_cast<int>(count));
}
