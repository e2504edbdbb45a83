#pragma once

#include "network/socket/nudpstream.h"

/// Datagrams to everyone on the local networks, or from everyone.
///
/// One thread at a time, but for `cancel`.
class NBroadcastStream : public NUDPStream
{
    DECLARE_TYPE(NBroadcastStream, NUDPStream)

    /// Without `receive` the stream sends.
    explicit NBroadcastStream(bool receive = false) : receiving(receive) {}

    /// A receiving stream is bound to the port, which several may share; another one sends to it.
    bool open(uint16 port);
    using NUDPStream::open;

    /// Sends the datagram to each local network. Fails where it could be sent to none of them, and on a receiving
    /// stream.
    int64 writeRaw(const void* data, int64 count) override;

private:
    bool receiving;
};
