#pragma once

#include "network/socket/nstream.h"

#include <chrono>
#include <vector>

/// A connection whose message is collected piece by piece, without waiting, until the other side ends it; then it is
/// read as any stream. One thread at a time.
class NMessageStream : public NStream
{
    DECLARE_TYPE(NMessageStream, NStream)

    enum Progress
    {
        kGoesOn,
        kComplete,
        /// Too much came, or the connection failed.
        kBroken
    };

    explicit NMessageStream(std::unique_ptr<NSocket> ownSocket);

    /// Takes what has come.
    Progress collect();
    /// Whether nothing has come for this many milliseconds.
    bool isStalled(int limit) const;

protected:
    int receiveSome(char* data, int size) override;

private:
    using Clock = std::chrono::steady_clock;

    std::vector<char> collected;
    size_t place = 0;
    Clock::time_point lastProgress = Clock::now();
};
