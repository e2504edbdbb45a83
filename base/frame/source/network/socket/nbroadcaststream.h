#pragma once

#include "network/socket/nudpstream.h"

/// Datagrams to everyone on the local networks, or those that everyone sends.
class NBroadcastStream : public NUDPStream
{
    DECLARE_TYPE(NBroadcastStream, NUDPStream)

    explicit NBroadcastStream(bool receive = false) : receiving(receive) {}

    /// A receiving stream is bound to the port; several may share one. Another one sends to it.
    bool open(uint16 port);
    using NUDPStream::open;

    /// Sends one datagram to each local network; the result counts as sent what reached one of them. Fails on a
    /// receiving stream.
    int64 writeRaw(const void* data, int64 count) override;

private:
    bool receiving;
};
