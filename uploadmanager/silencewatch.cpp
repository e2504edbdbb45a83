#include "uploadmanager/silencewatch.h"

#include <algorithm>

namespace
{
constexpr std::chrono::seconds kLongestLook{2};
}

SilenceWatch::Verdict SilenceWatch::look(const Bytes& bytes, Time now)
{
    silence += std::min<Duration>(now - lastLook.value_or(now), kLongestLook);
    lastLook = now;
    if (bytes != seen)
        silence = Duration::zero();
    seen = bytes;
    verdict = judge();
    return verdict;
}

SilenceWatch::Verdict SilenceWatch::judge() const
{
    const bool lacksContent = seen.sent < seen.total;
    if (lacksContent && seen.sent > 0 && seen.untaken == 0 && silence > kFileLimit)
        return Verdict::kFileEnded;
    const bool isSending = lacksContent || seen.untaken > 0;
    const Duration limit = isSending ? Duration(kSendingLimit) : Duration(kReplyLimit);
    return silence > limit ? Verdict::kNetworkSilent : Verdict::kMoving;
}
