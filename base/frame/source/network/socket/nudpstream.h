#pragma once

#include "network/socket/nstream.h"

/// Datagrams as a stream: each write sends one, each read takes one.
///
/// A read gives the datagram's bytes, cut to what was asked for; one that is empty gives 0. A write is sent whole
/// or fails. Datagrams may be lost, doubled and come in any order.
class NUDPStream : public NStream
{
    DECLARE_TYPE(NUDPStream, NStream)

    NUDPStream();

    /// Lets the stream send to and receive from this host alone. `timeout` limits, in seconds, how long the host is
    /// looked for.
    bool open(const char* host, uint16 port, int timeout) override;
    bool close() override;

    /// Who sent the datagram is the remote address from then on.
    int64 readRaw(void* data, int64 count) override;
    int64 writeRaw(const void* data, int64 count) override;
};
