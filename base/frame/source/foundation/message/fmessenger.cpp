#include "foundation/message/fmessenger.h"

#include "containers/keyed/cmassociation.h"
#include "containers/sequence/cmiterator.h"
#include "foundation/message/fmessage.h"
#include "foundation/message/fpostedmessage.h"
#include "foundation/message/imessagereceiver.h"
#include "foundation/object/singleton.h"
#include "foundation/text/cmstring.h"
#include "foundation/thread/flockscope.h"

DEFINE_INTERFACE_ID(IMessenger, 0x27A9E06D, 0xB5184C3F, 0x8E72D4F1, 0x0C963A5B)

FGlobalMessenger gMessenger;

DEFINE_INTERFACE_HOST(IMessenger, gMessenger)

namespace
{
// The flag value that the names are built with: pages of a few entries, as there are few names.
constexpr int kNamesPerPage = 3;

FObject* theMessenger = nullptr;

/// How receivers are compared: an object is asked for, since it may be posted to through several interfaces.
FUnknown* identityOf(FUnknown* receiver)
{
    return adopt(askInterface<FUnknown>(receiver)).get();
}

void removeMatching(CmQueue& queue, FUnknown* receiver, const char* messageType)
{
    CmLinkedListIterator it(queue);
    while (!it.done())
        if (static_cast<FPostedMessage*>(it.current())->matches(receiver, messageType))
            queue.remove(it);
        else
            it.next();
}
} // namespace

FMessenger::FMessenger() : names(kNamesPerPage)
{
    postedQueue.takeElements();
    readyQueue.takeElements();
    nameKeys.takeElements();
}

FMessenger* FMessenger::instance()
{
    if (!theMessenger && !Singleton::isTerminated())
    {
        theMessenger = new FMessenger;
        Singleton::registerInstance(&theMessenger);
    }
    return static_cast<FMessenger*>(theMessenger);
}

int32 FMessenger::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, IMessenger::iid))
        return offerInterface<IMessenger>(this, object);
    return CmObject::queryInterface(interfaceID, object);
}

// Posting

void FMessenger::doPostMessage(FUnknown* receiver, FMessage* message, bool unique, int delay)
{
    auto posted = adopt(new FPostedMessage(message, receiver, delay));
    FLockScope guard(postLock);
    if (unique && countPosted(postedQueue, receiver, message->getMessageID()) > 0)
        return;
    postedQueue.enqueue(posted.take());
}

void FMessenger::postMessage(CmObject* receiver, FMessage* message, bool unique, int delay)
{
    doPostMessage(identityOf(receiver), message, unique, delay);
}

void FMessenger::postMessage(int group, FMessage* message)
{
    CmLinkedList receivers;
    copyGroup(group, receivers);
    for (CmLinkedListIterator it(receivers); !it.done(); it.next())
        postMessage(it.current(), static_cast<FMessage*>(message->newCopy()));
    message->release();
}

void FMessenger::postMessage(const char* name, FMessage* message, bool toNetwork)
{
    const auto held = adopt(message);
    if (toNetwork)
        sendToNetwork(name, message);

    FLockScope guard(nameLock);
    if (CmObject* receiver = lookupName(name))
    {
        message->addRef();
        postMessage(receiver, message);
    }
}

int32 FMessenger::postMessage(IMessageReceiver* receiver, IMessage* message)
{
    auto* posted = FCast(FMessage, toFObject(message));
    if (!receiver || !posted)
    {
        if (message)
            message->release();
        return -1;
    }
    doPostMessage(identityOf(receiver), posted, false, 0);
    return kResultOk;
}

// Sending

int FMessenger::sendMessage(CmObject* receiver, FMessage* message)
{
    return receiver ? receiver->notify(message) : 0;
}

int FMessenger::sendMessage(int group, FMessage* message)
{
    CmLinkedList receivers;
    copyGroup(group, receivers);
    int result = 0;
    for (CmLinkedListIterator it(receivers); !it.done(); it.next())
        result = sendMessage(it.current(), message);
    return result;
}

int FMessenger::sendMessage(const char* name, FMessage* message, bool toNetwork)
{
    if (toNetwork)
        sendToNetwork(name, message);
    FLockScope guard(nameLock);
    return sendMessage(lookupName(name), message);
}

void FMessenger::sendToNetwork(const char* name, FMessage* message)
{
    if (INetworkMessenger* messenger = network)
        messenger->sendMessage(name, message);
}

// Delivery

void FMessenger::deliverMessages()
{
    if (deliveranceLocked || !isAnythingPosted())
        return;

    FLockScope guard(deliveryLock);
    collectDue();
    while (const auto due = adopt(static_cast<FPostedMessage*>(readyQueue.dequeue())))
        due->send();
}

bool FMessenger::isAnythingPosted()
{
    FLockScope guard(postLock);
    return !postedQueue.isEmpty();
}

void FMessenger::collectDue()
{
    FLockScope guard(postLock);
    CmQueue waiting;
    waiting.takeElements();
    while (auto* posted = static_cast<FPostedMessage*>(postedQueue.dequeue()))
        (posted->countDown() ? readyQueue : waiting).enqueue(posted);
    while (CmObject* posted = waiting.dequeue())
        postedQueue.enqueue(posted);
}

bool FMessenger::lockMessageDeliverance(bool locked)
{
    return deliveranceLocked.exchange(locked);
}

// What waits

void FMessenger::doKillMessages(FUnknown* receiver, const char* messageType)
{
    FLockScope deliveryGuard(deliveryLock);
    FLockScope postGuard(postLock);
    removeMatching(postedQueue, receiver, messageType);
    removeMatching(readyQueue, receiver, messageType);
}

void FMessenger::killMessages(CmObject* receiver, FMessage* message)
{
    doKillMessages(identityOf(receiver), message ? message->getMessageID() : nullptr);
}

int32 FMessenger::killMessages(IMessageReceiver* receiver, IMessage* message)
{
    if (!receiver)
        return -1;
    doKillMessages(identityOf(receiver), message ? message->getMessageID() : nullptr);
    return kResultOk;
}

int FMessenger::countPosted(const CmQueue& queue, FUnknown* receiver, const char* messageType)
{
    int count = 0;
    for (CmLinkedListIterator it(queue); !it.done(); it.next())
        if (static_cast<FPostedMessage*>(it.current())->matches(receiver, messageType))
            count++;
    return count;
}

bool FMessenger::areMessagesPosted(FUnknown* receiver, const char* messageType)
{
    FLockScope guard(postLock);
    return countPosted(postedQueue, identityOf(receiver), messageType) > 0;
}

int FMessenger::messagesPosted(CmObject* receiver, const char* messageType)
{
    FLockScope guard(postLock);
    return countPosted(postedQueue, identityOf(receiver), messageType);
}

int FMessenger::countWaiting()
{
    FLockScope guard(postLock);
    return postedQueue.total();
}

bool FMessenger::wasMessagePosted(IMessageReceiver* receiver)
{
    return areMessagesPosted(receiver, nullptr);
}

// Names

CmObject* FMessenger::lookupName(const char* name) const
{
    const CmString key(name);
    return names.lookupObject(&key);
}

void FMessenger::registerName(const char* name, CmObject* receiver)
{
    FLockScope guard(nameLock);
    unregisterName(name);
    auto* key = new CmString(name);
    nameKeys.add(key);
    names.add(key, receiver);
}

void FMessenger::unregisterName(const char* name)
{
    const CmString wanted(name);
    FLockScope guard(nameLock);
    const CmAssociation* entry = names.lookupAssoc(&wanted);
    if (!entry)
        return;
    CmObject* key = entry->getKey();
    names.remove(key);
    nameKeys.remove(key);
}

// Groups

CmLinkedList* FMessenger::groupAt(int group) const
{
    return notifyGroups ? static_cast<CmLinkedList*>(notifyGroups->at(group - 1)) : nullptr;
}

void FMessenger::copyGroup(int group, CmLinkedList& result)
{
    FLockScope guard(nameLock);
    if (const CmLinkedList* receivers = groupAt(group))
        result.addAllFromAbs(*receivers);
}

int FMessenger::createNotifyGroup()
{
    FLockScope guard(nameLock);
    if (!notifyGroups)
    {
        notifyGroups = adopt(new CmLinkedList);
        notifyGroups->takeElements();
    }
    notifyGroups->add(new CmLinkedList);
    return notifyGroups->total();
}

bool FMessenger::deleteNotifyGroup(int group)
{
    FLockScope guard(nameLock);
    return groupAt(group) && notifyGroups->removeAt(group - 1);
}

bool FMessenger::addToNotifyGroup(int group, CmObject* receiver)
{
    FLockScope guard(nameLock);
    CmLinkedList* receivers = groupAt(group);
    return receivers && receivers->add(receiver);
}

bool FMessenger::removeFromNotifyGroup(int group, CmObject* receiver)
{
    FLockScope guard(nameLock);
    CmLinkedList* receivers = groupAt(group);
    return receivers && receivers->removeAbs(receiver);
}
