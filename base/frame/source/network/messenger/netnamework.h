#pragma once

#include "foundation/text/fstring.h"
#include "foundation/thread/fworkclass.h"
#include "network/socket/nsocket.h"

class NMessenger;

/// Finds the name of an address, or the address of a name, and answers whoever asked. The messenger is borrowed.
class NetNameWork final : public FWorkClass
{
public:
    /// `host` is a name, or an address "a.b.c.d". `requestNumber` is the one that the messenger knows the asker by.
    NetNameWork(NMessenger& owner, const char* host, int requestNumber);

    void performThreadWork(void* data) override;
    void finished() override { delete this; }
    void cancelWork() override;

private:
    NMessenger& messenger;
    FString asked;
    int request;
    // Only ends the search.
    NSocket canceller{NSocket::kDatagram};
};
