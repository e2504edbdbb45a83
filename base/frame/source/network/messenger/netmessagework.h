#pragma once

#include "foundation/object/iptr.h"
#include "foundation/thread/fworkclass.h"
#include "network/messenger/nmessage.h"
#include "storage/url/furl.h"

#include <atomic>

class NMessenger;

/// Sends one message to one program. The messenger is borrowed, the message held.
class NetMessageWork final : public FWorkClass
{
public:
    NetMessageWork(NMessenger& owner, const FUrl& target, const char* receiverName,
                   const IPtr<NMessage>& messageCopy);

    void performThreadWork(void* data) override;
    void finished() override { delete this; }
    void cancelWork() override;

private:
    bool send(FStream& bytes);

    NMessenger& messenger;
    IPtr<FUrl> url;
    FString receiver;
    IPtr<NMessage> message;
    std::atomic<bool> cancelled{false};
};
