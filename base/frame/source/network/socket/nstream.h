#pragma once

#include "network/socket/naddress.h"
#include "network/socket/nsocket.h"
#include "storage/stream/fstream.h"

#include <memory>
#include <vector>

/// A stream over a TCP connection.
///
/// Reading and writing wait until all bytes are moved, the connection ends, a limit passes or `cancel` is called; what
/// was moved so far is the result. Reads go through a small buffer, so that reading byte by byte is cheap. There is
/// no seeking: `seek` gives -1 unless it stays in place, and `tell` counts the bytes read since `open`. FStream's
/// `readLine` goes back in its stream and so can't be used here. One thread at a time, but for `cancel`.
class NStream : public FStream
{
    DECLARE_TYPE(NStream, FStream)

    NStream();
    /// Takes over a socket, as an accepted one.
    explicit NStream(std::unique_ptr<NSocket> ownSocket);
    NStream(const NStream&) = delete;
    NStream& operator=(const NStream&) = delete;
    ~NStream() override;
    CmObject* newCopy() const override { return nullptr; }

    /// Finds the host and connects, both within `timeout` seconds; 0 or less is no limit. Closes what was open. False
    /// where it is not found, does not answer or `cancel` was called.
    virtual bool open(const char* host, uint16 port, int timeout);
    /// Ends the connection and forgets a cancel; false where there was none. What was written is still delivered.
    virtual bool close();
    /// Ends the operation that waits, if any, and lets all later ones fail until `close`. Any thread.
    virtual void cancel();

    bool isOpen() const { return socket->isCreated(); }
    bool isCancelled() const { return socket->isStopped(); }
    /// Never null.
    NSocket* getSocket() const { return socket.get(); }
    /// The other side: of the connection, or of the last datagram.
    const NAddress& getRemoteAddress() const { return remoteAddress; }
    uint16 getRemotePort() const { return remotePort; }
    /// A single wait for bytes, or for room to send, that lasts longer than this many milliseconds ends the
    /// operation; -1, as at first, is without limit.
    void setStallLimit(int milliseconds) { socket->setTransferLimit(milliseconds); }

    int64 readRaw(void* data, int64 count) override;
    int64 writeRaw(const void* data, int64 count) override;
    int64 seek(int64 position, FSeekMode mode) override;
    int64 tell() override { return bytesRead; }
    void rewind() override {}
    /// False once the connection failed other than by its orderly end.
    bool verify() override { return !failed; }
    using FStream::read;
    using FStream::seek;
    using FStream::tell;

protected:
    // What goes between the bytes of the stream and the socket, for a class that encrypts them. The base hands them
    // on to the socket; the calls wait.

    /// At least one byte, at most `size`; 0 at the end; negative on failure.
    virtual int receiveSome(char* data, int size);
    /// At least one byte; negative on failure.
    virtual int sendSome(const char* data, int size);

    /// Drops what was read ahead, and starts counting anew.
    void resetReading();

    std::unique_ptr<NSocket> socket;
    NAddress remoteAddress;
    uint16 remotePort = 0;

private:
    int64 takeBuffered(char* data, int64 count);
    int64 readSome(char* data, int64 count);

    bool failed = false;
    int64 bytesRead = 0;
    // Bytes that came with others that were asked for.
    std::vector<char> buffer;
    size_t bufferStart = 0;
    size_t bufferEnd = 0;
};
