#include "network/socket/nstream.h"

#include "network/socket/naddresslookup.h"

#include <algorithm>
#include <chrono>
#include <climits>
#include <cstring>

namespace
{
using Clock = std::chrono::steady_clock;

constexpr size_t kReadAhead = 8192;
constexpr int kMillisecondsPerSecond = 1000;

/// What is left of a limit in seconds since `begin`, in milliseconds; -1 where there is none.
int timeLeft(Clock::time_point begin, int seconds)
{
    if (seconds <= 0)
        return -1;
    const auto limit = std::chrono::milliseconds(int64{seconds} * kMillisecondsPerSecond);
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(begin + limit - Clock::now()).count();
    return static_cast<int>(std::clamp<int64>(left, 0, INT_MAX));
}

/// As many of these bytes as one call can move.
int pieceOf(int64 count)
{
    return static_cast<int>(std::min<int64>(count, INT_MAX));
}
} // namespace

NStream::NStream() : NStream(std::make_unique<NSocket>(NSocket::kStream)) {}

NStream::NStream(std::unique_ptr<NSocket> ownSocket) : socket(std::move(ownSocket))
{
    socket->getPeer(remoteAddress.bytes, &remotePort);
}

NStream::~NStream() = default;

bool NStream::open(const char* host, uint16 port, int timeout)
{
    const auto begin = Clock::now();
    socket->disconnect();
    resetReading();
    for (const NAddress& address : NAddressLookup::findHost(host, timeLeft(begin, timeout), socket.get()))
    {
        if (!socket->connect(address, port, timeLeft(begin, timeout)))
            continue;
        remoteAddress = address;
        remotePort = port;
        return true;
    }
    return false;
}

bool NStream::close()
{
    const bool wasOpen = isOpen();
    socket->endSocket();
    resetReading();
    return wasOpen;
}

void NStream::cancel()
{
    socket->stopOperation();
}

void NStream::resetReading()
{
    bytesRead = 0;
    bufferStart = bufferEnd = 0;
    failed = false;
}

// Transfer

int NStream::receiveSome(char* data, int size)
{
    return socket->receiveData(data, size);
}

int NStream::sendSome(const char* data, int size)
{
    return socket->sendData(data, size);
}

int64 NStream::takeBuffered(char* data, int64 count)
{
    const auto taken =
        static_cast<size_t>(std::min<int64>(count, static_cast<int64>(bufferEnd - bufferStart)));
    if (taken > 0)
        memcpy(data, buffer.data() + bufferStart, taken);
    bufferStart += taken;
    return static_cast<int64>(taken);
}

/// Reads at least one byte: straight to `data` where much is asked for, else ahead. Not above 0 at the end.
int64 NStream::readSome(char* data, int64 count)
{
    if (bufferStart < bufferEnd)
        return takeBuffered(data, count);
    if (count >= static_cast<int64>(kReadAhead))
        return receiveSome(data, pieceOf(count));
    buffer.resize(kReadAhead);
    const int received = receiveSome(buffer.data(), static_cast<int>(kReadAhead));
    bufferStart = 0;
    bufferEnd = received > 0 ? static_cast<size_t>(received) : 0;
    return received > 0 ? takeBuffered(data, count) : received;
}

int64 NStream::readRaw(void* data, int64 count)
{
    auto* target = static_cast<char*>(data);
    int64 total = 0;
    while (total < count)
    {
        const int64 moved = readSome(target + total, count - total);
        failed = failed || moved < 0;
        if (moved <= 0)
            break;
        total += moved;
    }
    bytesRead += total;
    return total;
}

int64 NStream::writeRaw(const void* data, int64 count)
{
    const auto* source = static_cast<const char*>(data);
    int64 total = 0;
    while (total < count)
    {
        const int moved = sendSome(source + total, pieceOf(count - total));
        failed = failed || moved <= 0;
        if (moved <= 0)
            break;
        total += moved;
    }
    return total;
}

int64 NStream::seek(int64 position, FSeekMode mode)
{
    const bool staysInPlace =
        (mode == kSeekCurrent && position == 0) || (mode == kSeekStart && position == bytesRead);
    return staysInPlace ? bytesRead : -1;
}
