#pragma once

#include <chrono>
#include <optional>

/// Tells that a transfer has come to a standstill: for too long no byte went out, was taken by the other side or came in.
///
/// It is shown the transfer once or twice a second. Of a longer time between two looks only two seconds count, since the
/// process may have been stopped meanwhile, or a question been up. A transfer begins with a new watch. One thread at a
/// time.
class SilenceWatch
{
public:
    using Time = std::chrono::steady_clock::time_point;
    using Duration = std::chrono::steady_clock::duration;

    /// A file that gives nothing more is on a disk: that shows soon.
    static constexpr std::chrono::seconds kFileLimit{5};
    /// A phone that lost its cell is mostly heard again within a minute; by then the system pauses as long between tries.
    static constexpr std::chrono::minutes kSendingLimit{2};
    /// A service may work on what it got before it replies. The library gives a connection as long to come about.
    static constexpr std::chrono::minutes kReplyLimit{5};

    /// Since the transfer began.
    struct Bytes
    {
        double total = 0; ///< to send; 0 until that is known
        double sent = 0;  ///< given to the connection
        double received = 0;
        /// Given to the connection, and not yet with the other side; -1 where that can't be told.
        int untaken = 0;

        bool operator==(const Bytes& other) const = default;
    };

    enum class Verdict
    {
        kMoving,
        /// All that was sent is with the other side, and there should be more.
        kFileEnded,
        kNetworkSilent
    };

    /// Whether it is time to look again: to find out what is untaken costs a system call, and while a transfer moves it
    /// can be looked at thousands of times a second.
    bool isDue(Time now) const { return !lastLook || now - *lastLook >= kPause; }
    Verdict look(const Bytes& bytes, Time now);
    /// As the last look has it.
    bool isNetworkSilent() const { return verdict == Verdict::kNetworkSilent; }

private:
    static constexpr std::chrono::milliseconds kPause{500};

    Verdict judge() const;

    Bytes seen;
    std::optional<Time> lastLook;
    Duration silence{0};
    Verdict verdict = Verdict::kMoving;
};
