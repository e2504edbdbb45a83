#pragma once

#include "containers/keyed/cmbtreedictionary.h"
#include "containers/sequence/cmarray.h"
#include "containers/sequence/cmlinkedlist.h"
#include "containers/sequence/cmqueue.h"
#include "foundation/message/imessenger.h"
#include "foundation/object/cmobject.h"
#include "foundation/object/iptr.h"
#include "foundation/thread/flock.h"

#include <atomic>

class FMessage;

/// Takes messages that go to a name on to other processes. Thread-safe; called with no lock held.
class INetworkMessenger
{
public:
    virtual void sendMessage(const char* name, FMessage* message) = 0;

protected:
    ~INetworkMessenger() = default;
};

/// Carries messages to receivers, at once or at the next pulse.
///
/// Posting takes over the caller's reference on the message; sending leaves it with the caller. Receivers are
/// borrowed: whoever receives calls `killMessages` in its destructor. Any thread posts; all else belongs to the
/// main thread. The lock order is `deliveryLock` before `postLock`; no receiver is called under `postLock`.
class FMessenger : public CmObject, public IMessenger
{
    DECLARE_TYPE(FMessenger, CmObject)

    FMessenger();

    /// Null after the process-wide objects were torn down.
    static FMessenger* instance();

    /// With `unique` the message is dropped where one of its type waits for the receiver already. `delay` counts
    /// the deliveries that pass it by.
    void postMessage(CmObject* receiver, FMessage* message, bool unique = false, int delay = 0);
    /// Posts a copy to each receiver of the group.
    void postMessage(int group, FMessage* message);
    /// Posts to the receiver of this name, if there is one; with `toNetwork` the message first goes to other
    /// processes.
    void postMessage(const char* name, FMessage* message, bool toNetwork);

    /// Calls the receiver now and gives its result, 0 where there is none.
    int sendMessage(CmObject* receiver, FMessage* message);
    /// Calls each receiver of the group; gives the result of the last one.
    int sendMessage(int group, FMessage* message);
    /// The names stay locked during the call, so that the receiver can't take its name back meanwhile.
    int sendMessage(const char* name, FMessage* message, bool toNetwork);

    /// Delivers what is due; what is posted meanwhile waits for the next call. Main thread.
    void deliverMessages();
    /// While true, `deliverMessages` does nothing. Gives the former value. Main thread.
    bool lockMessageDeliverance(bool locked);

    /// Drops all waiting messages of `receiver`: those of the type of `message`, or all if that is null.
    void killMessages(CmObject* receiver, FMessage* message);
    /// Whether a message of this type, or any if it is null, waits for `receiver`.
    bool areMessagesPosted(FUnknown* receiver, const char* messageType);
    /// How many of them.
    int messagesPosted(CmObject* receiver, const char* messageType);

    /// How many messages wait for whomever.
    int countWaiting();

    /// A name that is taken already goes to the new receiver.
    void registerName(const char* name, CmObject* receiver);
    void unregisterName(const char* name);

    /// A group's number is its place, from 1: deleting one moves the later ones down.
    int createNotifyGroup();
    bool deleteNotifyGroup(int group);
    bool addToNotifyGroup(int group, CmObject* receiver);
    bool removeFromNotifyGroup(int group, CmObject* receiver);

    /// `messenger` is borrowed and may be null.
    void setNetwork(INetworkMessenger* messenger) { network = messenger; }

    int32 queryInterface(const char* interfaceID, void** object) override;
    FORWARD_FUNKNOWN(CmObject)
    int32 postMessage(IMessageReceiver* receiver, IMessage* message) override;
    int32 killMessages(IMessageReceiver* receiver, IMessage* message) override;
    bool wasMessagePosted(IMessageReceiver* receiver) override;

private:
    void doPostMessage(FUnknown* receiver, FMessage* message, bool unique, int delay);
    void doKillMessages(FUnknown* receiver, const char* messageType);
    void collectDue();
    bool isAnythingPosted();
    static int countPosted(const CmQueue& queue, FUnknown* receiver, const char* messageType);
    CmObject* lookupName(const char* name) const;
    CmLinkedList* groupAt(int group) const;
    void copyGroup(int group, CmLinkedList& result);
    void sendToNetwork(const char* name, FMessage* message);

    FLock postLock{"post"};
    CmQueue postedQueue;
    FLock deliveryLock{"delivery"};
    CmQueue readyQueue;
    FLock nameLock{"names"};
    std::atomic<bool> deliveranceLocked{false};
    // The dictionary borrows its keys, since it has one ownership for them and the receivers.
    CmArray nameKeys{0, 10};
    CmBTreeDictionary names;
    IPtr<CmLinkedList> notifyGroups;
    std::atomic<INetworkMessenger*> network{nullptr};
};

/// The messenger as other threads see it: set at start, null again when the application goes. Thread-safe.
class FGlobalMessenger
{
public:
    FGlobalMessenger& operator=(FMessenger* messenger)
    {
        pointer = messenger;
        return *this;
    }
    operator FMessenger*() const { return pointer; }
    FMessenger* operator->() const { return pointer; }

private:
    std::atomic<FMessenger*> pointer{nullptr};
};

extern FGlobalMessenger gMessenger;
