#pragma once

#include "foundation/message/fmessage.h"

struct NAddress;

/// A message that came over the network. One thread at a time; posting hands it over.
class NMessage : public FMessage
{
    DECLARE_CLASS(NMessage, FMessage)

    using FMessage::FMessage;

    /// Who sent it. What the sender claims to be is replaced.
    void setRemote(const NAddress& address, uint16 port);
    ConstString getRemoteAddress() const;
    uint16 getRemotePort() const;

    /// On the clocks of the two sides, in microseconds; false where that side has none.
    bool getSentTime(int64& microseconds) const;
    bool getReceivedTime(int64& microseconds) const;
    void setSentTime(int64 microseconds);
    void setReceivedTime(int64 microseconds);

private:
    bool getTime(const char* key, int64& microseconds) const;
};
