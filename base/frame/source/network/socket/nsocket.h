#pragma once

#include "network/socket/naddress.h"

#include <atomic>
#include <memory>

/// What a socket may be waited for.
enum PendingQuery : int32
{
    /// Bytes, a connection, or the end of what comes.
    kPendingRead = 0,
    /// Room for bytes to send, or the end of connecting.
    kPendingWrite = 1
};

/// Results of a transfer that aren't a number of bytes.
inline constexpr int kSocketFailed = -1;
/// In non-blocking mode only: nothing can be done now.
inline constexpr int kSocketWouldBlock = -2;

/// A socket of the system, for IPv4, with a type and a state.
///
/// The system's socket never blocks. In the object's blocking mode, which it starts in, operations wait for their
/// turn until they can be done, the time limit passes or `stopOperation` is called. Sockets are not inherited by
/// programs that are started. One thread at a time, but for `stopOperation`, `isStopped` and `isCreated`, which any
/// thread may call while the object lives.
class NSocket
{
public:
    enum Type : int32
    {
        /// TCP.
        kStream = 1,
        /// UDP.
        kDatagram = 2
    };
    enum State : int32
    {
        kNotCreated,
        kCreated,
        kBound,
        kListening,
        kConnected
    };

    explicit NSocket(Type socketType);
    NSocket(const NSocket&) = delete;
    NSocket& operator=(const NSocket&) = delete;
    ~NSocket();

    Type getType() const { return type; }
    State getState() const { return state; }
    bool isCreated() const { return state != kNotCreated; }

    /// Makes the system's socket; true also where there is one. The operations that need one call it.
    bool create();
    /// Closes the system's socket; a stop stays.
    void disconnect();
    /// Closes the system's socket and forgets a stop, so that the object can be used again.
    void endSocket();
    /// Ends whatever operation waits, and every later one, until `endSocket`. Any thread.
    void stopOperation();
    bool isStopped() const { return stopped; }
    /// Waits at most `timeout` milliseconds, -1 without limit, for a stop; whether there was one.
    bool waitForStop(int timeout) const;

    // Addresses

    /// Binds to this port of `bindAddress`, by default every address of this host; port 0 takes a free one. A port
    /// that was used a moment ago can be had again; for datagrams several sockets may share one.
    bool bind(uint16 port);
    void setBindAddress(const NAddress& address) { bindAddress = address; }
    const NAddress& getBindAddress() const { return bindAddress; }
    /// The four bytes and the port of the other side; false where there is none. Either may be null.
    bool getPeer(void* address, uint16* port) const;
    /// As `getPeer`, of this side.
    bool getLocal(void* address, uint16* port) const;

    // Connections

    /// `backlog` connections wait for `accept`.
    bool listen(int backlog);
    /// The next connection, in blocking mode after waiting for it; null where none came. `address` takes its four
    /// bytes, with `size` as the room and then what was taken; both may be null. `nonBlockingResult` is the
    /// mode of the new socket.
    std::unique_ptr<NSocket> accept(void* address, int* size, bool nonBlockingResult);
    /// Connects within this many milliseconds, -1 for no limit. For datagrams it sets whom they go to and come from.
    bool connect(const NAddress& address, uint16 port, int timeout);

    // Transfer

    /// Sends what fits, at least a byte in blocking mode, and gives how many; or one of the results above.
    int sendData(const char* data, int size);
    /// As many bytes as are there, at least one in blocking mode; 0 at the end of the connection; or one of the
    /// results above. A datagram comes whole, cut to `size`, and may be empty.
    int receiveData(char* data, int size);
    /// A datagram to this address.
    int sendDataTo(const NAddress& address, uint16 port, const char* data, int size);
    /// A datagram, and who sent it.
    int receiveDataFrom(NAddress& address, uint16& port, char* data, int size);
    /// Whether that can be done now or within `timeout` milliseconds; -1 waits without limit. True also where it
    /// would fail at once. False when the time is over or the socket was stopped.
    bool isPending(PendingQuery query, int timeout);
    /// Tells the other side that nothing more is sent; what it sends can still be received.
    bool endSending();

    // Options

    void setNonBlockingMode(bool on) { nonBlocking = on; }
    bool nonBlockingModeSet() const { return nonBlocking; }
    /// How long a blocking send or receive waits at most, in milliseconds; -1, as at first, is without limit.
    void setTransferLimit(int milliseconds) { transferLimit = milliseconds; }
    /// Sends small pieces at once.
    bool setTcpNoDelay(bool on);
    bool setBroadcast(bool on);
    /// In bytes, as the system counts them, which may be more than was asked for; 0 where it can't be told.
    unsigned getSendBufferSize() const;
    bool setSendBufferSize(unsigned bytes);
    unsigned getReceiveBufferSize() const;
    bool setReceiveBufferSize(unsigned bytes);

private:
    friend class NSocketPoll;

    NSocket(Type socketType, int connectedHandle);
    static bool tell(const NAddress& found, uint16 foundPort, void* address, uint16* port);
    template <class Step>
    int transfer(PendingQuery query, Step step);

    Type type;
    std::atomic<State> state{kNotCreated};
    std::atomic<bool> stopped{false};
    bool nonBlocking = false;
    int transferLimit = -1;
    NAddress bindAddress;
    int handle = -1;
    // Lets `stopOperation` end a wait; lives as long as the object.
    int wakeHandle = -1;
};
