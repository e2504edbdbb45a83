#include "network/socket/nserver.h"

#include "network/socket/naddresslookup.h"
#include "network/socket/nstream.h"

NServer::NServer(uint16 serverPort, int serverBacklog) : port(serverPort), backlog(serverBacklog) {}

bool NServer::setAddress(const char* address)
{
    NAddress served;
    if (!served.fromText(address))
        return false;
    socket.setBindAddress(served);
    return true;
}

bool NServer::open(int timeout)
{
    socket.endSocket();
    socket.setTransferLimit(timeout);
    if (socket.bind(port) && socket.listen(backlog))
        return true;
    socket.disconnect();
    return false;
}

NStream* NServer::waitForConnection()
{
    if (!isOpen())
        return nullptr;
    auto connection = socket.accept(nullptr, nullptr, false);
    return connection ? makeStream(std::move(connection)) : nullptr;
}

NStream* NServer::makeStream(std::unique_ptr<NSocket> connection)
{
    return new NStream(std::move(connection));
}

void NServer::stop()
{
    socket.stopOperation();
}

void NServer::close()
{
    socket.disconnect();
}

uint16 NServer::getLocalPort() const
{
    uint16 listening = 0;
    return socket.getLocal(nullptr, &listening) ? listening : port;
}

void NServer::getHostName(String& name) const
{
    NAddressLookup::getLocalHostName(name);
}

void NServer::getIPAddress(String& address) const
{
    const NAddress& served = socket.getBindAddress();
    (served.isAny() ? NAddressLookup::getLocalAddress() : served).toText(address);
}
