#pragma once

#include "foundation/object/funknown.h"

class IMessage;
class IMessageReceiver;

/// Posting as components see it. A receiver is not held: it takes back its messages before it goes.
/// Posting is thread-safe; all else belongs to the main thread.
class IMessenger : public FUnknown
{
public:
    /// Takes over the caller's reference on `message`, which must come from the framework. 0, or -1 where there is no
    /// receiver or no such message. Any thread.
    virtual int32 postMessage(IMessageReceiver* receiver, IMessage* message) = 0;
    /// Drops the waiting messages of `receiver`: those of the type of `message`, or all if that is null.
    virtual int32 killMessages(IMessageReceiver* receiver, IMessage* message) = 0;
    virtual bool wasMessagePosted(IMessageReceiver* receiver) = 0;

    DECLARE_INTERFACE_ID
};
