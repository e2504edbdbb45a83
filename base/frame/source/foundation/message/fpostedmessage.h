#pragma once

#include "foundation/message/fmessage.h"
#include "foundation/object/iptr.h"

/// A message on its way. The receiver is borrowed. *One thread at a time*.
class FPostedMessage : public CmObject
{
    DECLARE_TYPE(FPostedMessage, CmObject)

    /// Takes over the caller's reference on `posted`.
    FPostedMessage(FMessage* posted, FUnknown* target, int deliveries);

    /// Hands the message to the receiver and gives its result; -1 where the receiver takes no messages.
    int send();
    /// Whether it goes to `target` and has the type of `other`, if that isn't null.
    bool matches(FUnknown* target, const char* messageType) const;
    /// Counts one delivery; true when the message is due.
    bool countDown();

private:
    IPtr<FMessage> message;
    FUnknown* receiver;
    int delay;
};
