#include "network/socket/nsocket.h"

#include "network/socket/nsocketpoll.h"
#include "network/socket/platformsocket.h"

#include <cstring>

NSocket::NSocket(Type socketType) : type(socketType), wakeHandle(PlatformSocket::createWake()) {}

NSocket::NSocket(Type socketType, int connectedHandle) : NSocket(socketType)
{
    handle = connectedHandle;
    state = kConnected;
}

NSocket::~NSocket()
{
    disconnect();
    PlatformSocket::close(wakeHandle);
}

bool NSocket::create()
{
    if (handle >= 0)
        return true;
    // Without it nobody could end a wait.
    if (wakeHandle < 0)
        return false;
    handle = PlatformSocket::create(type);
    if (handle < 0)
        return false;
    state = kCreated;
    return true;
}

void NSocket::disconnect()
{
    PlatformSocket::close(handle);
    handle = -1;
    state = kNotCreated;
}

void NSocket::endSocket()
{
    disconnect();
    PlatformSocket::clearWake(wakeHandle);
    stopped = false;
}

void NSocket::stopOperation()
{
    stopped = true;
    PlatformSocket::wake(wakeHandle);
}

bool NSocket::waitForStop(int timeout) const
{
    NSocketPoll poll;
    poll.addCanceller(*this);
    poll.wait(timeout);
    return stopped;
}

// Addresses

bool NSocket::bind(uint16 port)
{
    if (!create() || !PlatformSocket::bind(handle, bindAddress, port))
        return false;
    state = kBound;
    return true;
}

bool NSocket::getPeer(void* address, uint16* port) const
{
    NAddress found;
    uint16 foundPort = 0;
    return PlatformSocket::getPeer(handle, found, foundPort) && tell(found, foundPort, address, port);
}

bool NSocket::getLocal(void* address, uint16* port) const
{
    NAddress found;
    uint16 foundPort = 0;
    return PlatformSocket::getLocal(handle, found, foundPort) && tell(found, foundPort, address, port);
}

bool NSocket::tell(const NAddress& found, uint16 foundPort, void* address, uint16* port)
{
    if (address)
        memcpy(address, found.bytes, NAddress::kSize);
    if (port)
        *port = foundPort;
    return true;
}

// Connections

bool NSocket::listen(int backlog)
{
    if (!create() || !PlatformSocket::listen(handle, backlog))
        return false;
    state = kListening;
    return true;
}

std::unique_ptr<NSocket> NSocket::accept(void* address, int* size, bool nonBlockingResult)
{
    NAddress peer;
    const int accepted = transfer(kPendingRead, [&] { return PlatformSocket::accept(handle, peer); });
    if (accepted < 0)
        return nullptr;
    if (address && size && *size >= NAddress::kSize)
    {
        memcpy(address, peer.bytes, NAddress::kSize);
        *size = NAddress::kSize;
    }
    std::unique_ptr<NSocket> result(new NSocket(type, accepted));
    result->nonBlocking = nonBlockingResult;
    // No wait on it could be ended.
    return result->wakeHandle < 0 ? nullptr : std::move(result);
}

bool NSocket::connect(const NAddress& address, uint16 port, int timeout)
{
    if (stopped || !create())
        return false;
    const int begun = PlatformSocket::connect(handle, address, port);
    const bool isDone = begun == 0 || (begun == kSocketWouldBlock && isPending(kPendingWrite, timeout) &&
                                       PlatformSocket::isConnected(handle));
    if (isDone)
        state = kConnected;
    else
        disconnect();
    return isDone;
}

// Transfer

/// Repeats the step, in blocking mode, until it can be done.
template <class Step>
int NSocket::transfer(PendingQuery query, Step step)
{
    if (handle < 0 || stopped)
        return kSocketFailed;
    for (;;)
    {
        const int result = step();
        if (result != kSocketWouldBlock || nonBlocking)
            return result;
        if (!isPending(query, transferLimit))
            return kSocketFailed;
    }
}

int NSocket::sendData(const char* data, int size)
{
    return transfer(kPendingWrite, [&] { return PlatformSocket::send(handle, data, size, nullptr, 0); });
}

int NSocket::receiveData(char* data, int size)
{
    return transfer(kPendingRead,
                    [&] { return PlatformSocket::receive(handle, data, size, nullptr, nullptr); });
}

int NSocket::sendDataTo(const NAddress& address, uint16 port, const char* data, int size)
{
    if (!create())
        return kSocketFailed;
    return transfer(kPendingWrite, [&] { return PlatformSocket::send(handle, data, size, &address, port); });
}

int NSocket::receiveDataFrom(NAddress& address, uint16& port, char* data, int size)
{
    return transfer(kPendingRead,
                    [&] { return PlatformSocket::receive(handle, data, size, &address, &port); });
}

bool NSocket::isPending(PendingQuery query, int timeout)
{
    if (handle < 0 || stopped)
        return false;
    NSocketPoll poll;
    poll.add(*this, query);
    return poll.wait(timeout);
}

bool NSocket::endSending()
{
    return handle >= 0 && PlatformSocket::endSending(handle);
}

// Options

bool NSocket::setTcpNoDelay(bool on)
{
    return create() && PlatformSocket::setOption(handle, PlatformSocket::kNoDelay, on);
}

bool NSocket::setBroadcast(bool on)
{
    return create() && PlatformSocket::setOption(handle, PlatformSocket::kBroadcast, on);
}

unsigned NSocket::getSendBufferSize() const
{
    return static_cast<unsigned>(PlatformSocket::getOption(handle, PlatformSocket::kSendBuffer));
}

bool NSocket::setSendBufferSize(unsigned bytes)
{
    return create() &&
           PlatformSocket::setOption(handle, PlatformSocket::kSendBuffer, static_cast<int>(bytes));
}

unsigned NSocket::getReceiveBufferSize() const
{
    return static_cast<unsigned>(PlatformSocket::getOption(handle, PlatformSocket::kReceiveBuffer));
}

bool NSocket::setReceiveBufferSize(unsigned bytes)
{
    return create() &&
           PlatformSocket::setOption(handle, PlatformSocket::kReceiveBuffer, static_cast<int>(bytes));
}
