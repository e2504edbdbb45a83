#include "network/messenger/nmessagestream.h"

#include "network/messenger/netmessageform.h"

#include <algorithm>
#include <cstring>

namespace
{
constexpr int kPiece = 65536;
/// How much is taken before it is another connection's turn.
constexpr int kPiecesPerTurn = 16;
} // namespace

NMessageStream::NMessageStream(std::unique_ptr<NSocket> ownSocket) : NStream(std::move(ownSocket))
{
    socket->setNonBlockingMode(true);
}

NMessageStream::Progress NMessageStream::collect()
{
    std::vector<char> piece(kPiece);
    for (int i = 0; i < kPiecesPerTurn; i++)
    {
        const int received = socket->receiveData(piece.data(), kPiece);
        if (received == kSocketWouldBlock)
            return kGoesOn;
        if (received <= 0)
            return received == 0 ? kComplete : kBroken;
        collected.insert(collected.end(), piece.begin(), piece.begin() + received);
        if (collected.size() > kMaxNetMessage)
            return kBroken;
        lastProgress = Clock::now();
    }
    return kGoesOn;
}

bool NMessageStream::isStalled(int limit) const
{
    return Clock::now() - lastProgress > std::chrono::milliseconds(limit);
}

int NMessageStream::receiveSome(char* data, int size)
{
    const size_t count = std::min(static_cast<size_t>(size), collected.size() - place);
    if (count > 0)
        memcpy(data, collected.data() + place, count);
    place += count;
    return static_cast<int>(count);
}
