#pragma once

#include "foundation/object/funknown.h"

class IMessage;

/// Somebody outside the class tree who takes messages, on the main thread when they
/// were posted.
class IMessageReceiver : public FUnknown
{
public:
    /// The message belongs to the caller.
    virtual int32 notify(IMessage* message) = 0;

    DECLARE_INTERFACE_ID
};
