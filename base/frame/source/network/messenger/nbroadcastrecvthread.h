#pragma once

#include "foundation/object/iptr.h"
#include "foundation/thread/fthread.h"
#include "network/socket/nbroadcaststream.h"

class CmBuffer;
class NMessenger;

/// Hears the hellos and goodbyes of other programs.
///
/// The owner, which is borrowed, calls `open`, `run` and `end`; the rest belongs to the thread itself.
class NBroadcastRecvThread : public FThread
{
public:
    NBroadcastRecvThread(NMessenger& owner, uint16 broadcastPort);
    ~NBroadcastRecvThread() override;

    /// Binds to the port; false where it can't be had.
    bool open() { return stream->open(port); }
    int entry() override;
    /// Stops and waits for the thread.
    void end();

    /// Tells the notify group about the hello or goodbye in a datagram, and the messenger about the peer. `timeStamp`
    /// is that of reception, 0 without a clock. What is neither, or comes from the messenger itself, is dropped.
    void handleBroadcastMessage(CmBuffer& data, int64 timeStamp, const NAddress& sender, uint16 senderPort);

private:
    NMessenger& messenger;
    uint16 port;
    IPtr<NBroadcastStream> stream;
};
