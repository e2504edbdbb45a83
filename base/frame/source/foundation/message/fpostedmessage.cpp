#include "foundation/message/fpostedmessage.h"

#include "foundation/message/imessagereceiver.h"

DEFINE_INTERFACE_ID(IMessageReceiver, 0x91F4D83A, 0x0B7C4E25, 0x9A6E5D10, 0xE2C7B846)

FPostedMessage::FPostedMessage(FMessage* posted, FUnknown* target, int deliveries)
    : message(IPtr<FMessage>::adopt(posted)),
      receiver(target),
      delay(deliveries)
{
}

int FPostedMessage::send()
{
    if (const auto taker = adopt(askInterface<IMessageReceiver>(receiver)))
        return taker->notify(message.get());
    if (CmObject* object = toCmObject(receiver))
        return object->notify(message);
    return -1;
}

bool FPostedMessage::matches(FUnknown* target, const char* messageType) const
{
    return receiver == target && (!messageType || message->isType(messageType));
}

bool FPostedMessage::countDown()
{
    if (delay < 1)
        return true;
    delay--;
    return false;
}
