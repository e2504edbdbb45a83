#pragma once

#include "foundation/object/iptr.h"
#include "foundation/thread/fworkclass.h"
#include "storage/stream/fmemorystream.h"
#include "storage/url/furl.h"

#include <atomic>

class NMessenger;

/// Sends one message to one program. The messenger is borrowed. The bytes of the message are held, and are never
/// changed, so that all the works of a message share them.
class NetMessageWork final : public FWorkClass
{
public:
    NetMessageWork(NMessenger& owner, const FUrl& target, const IPtr<FMemoryStream>& messageBytes);

    void performThreadWork(void* data) override;
    void finished() override { delete this; }
    void cancelWork() override;

private:
    bool send(const FMemoryStream& toSend);

    NMessenger& messenger;
    IPtr<FUrl> url;
    IPtr<FMemoryStream> bytes;
    std::atomic<bool> cancelled{false};
};
