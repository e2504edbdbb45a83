#pragma once

#include "network/socket/nstream.h"

/// Datagrams as a stream: each write sends one, each read takes one.
///
/// A read gives the datagram's bytes, cut to what was asked for, and 0 for an empty one; a write is sent whole or
/// fails; either gives -1 on failure. Datagrams may be lost, doubled and come in any order. `open` sets the one host
/// and port that the stream sends to and receives from, and tells nothing about whether anybody is there. After a
/// read the remote address is that of the sender. One thread at a time, but for `cancel`.
class NUDPStream : public NStream
{
    DECLARE_TYPE(NUDPStream, NStream)

    NUDPStream();

    int64 readRaw(void* data, int64 count) override;
    int64 writeRaw(const void* data, int64 count) override;

protected:
    /// In bytes; more than any datagram holds.
    static constexpr int64 kMaxDatagram = 65536;
};
