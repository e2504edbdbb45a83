#include "foundation/message/updatehandler.h"

#include "foundation/object/iptr.h"
#include "foundation/object/singleton.h"
#include "foundation/thread/flockscope.h"

#include <cstdint>

DEFINE_INTERFACE_ID(IUpdateManager, 0x3C6E0F2B, 0x9D4A4E17, 0xA5B80D61, 0x7F29C3E4)

namespace
{
constexpr int32 kUnusableArgument = 1;
constexpr int kBucketPlaces = 10;

FObject* theHandler = nullptr;

/// The pointer by which an object is known. No reference is kept: the caller's own keeps the object for the call.
FUnknown* identityOf(FUnknown* object)
{
    return adopt(askInterface<FUnknown>(object)).get();
}

void tellUpdateDone(FUnknown* object, int message)
{
    if (message == kMessageDestroyed)
        return;
    if (FObject* changed = toFObject(object))
        changed->updateDone(message);
}
} // namespace

UpdateHandler::UpdateHandler()
{
    for (Bucket& bucket : dependentTable)
        bucket.resize(kBucketPlaces);
    if (!gUpdateHandler)
        gUpdateHandler = this;
}

UpdateHandler::~UpdateHandler()
{
    if (gUpdateHandler == this)
        gUpdateHandler = nullptr;
}

UpdateHandler* UpdateHandler::instance()
{
    if (!theHandler && !Singleton::isTerminated())
    {
        theHandler = new UpdateHandler;
        Singleton::registerInstance(&theHandler);
    }
    return static_cast<UpdateHandler*>(theHandler);
}

int32 UpdateHandler::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, IUpdateHandler::iid))
        return offerInterface<IUpdateHandler>(this, object);
    if (isSameInterface(interfaceID, IUpdateManager::iid))
        return offerInterface<IUpdateManager>(this, object);
    return FObject::queryInterface(interfaceID, object);
}

UpdateHandler::Bucket& UpdateHandler::bucketOf(FUnknown* object)
{
    return dependentTable[(reinterpret_cast<uintptr_t>(object) >> 12) & 0xFF];
}

int32 UpdateHandler::addDependent(FUnknown* object, IDependent* dependent)
{
    FUnknown* identity = identityOf(object);
    if (!identity || !dependent)
        return kUnusableArgument;

    FLockScope guard(lock);
    bucketOf(identity).add({identity, dependent});
    return kResultOk;
}

int32 UpdateHandler::removeDependent(FUnknown* object, IDependent* dependent)
{
    FUnknown* identity = identityOf(object);
    if (!identity && (object || !dependent))
        return kUnusableArgument;

    FLockScope guard(lock);
    skipInRunningUpdates(identity, dependent);
    if (identity)
        removeFrom(bucketOf(identity), identity, dependent);
    else
        for (Bucket& bucket : dependentTable)
            removeFrom(bucket, nullptr, dependent);
    return kResultOk;
}

void UpdateHandler::skipInRunningUpdates(FUnknown* object, IDependent* dependent)
{
    for (TLinkedListIterator<Update::Running*> it(updatesInProgress); !it.done(); it.next())
    {
        const Update::Running& running = *it.current();
        if (object && running.object != object)
            continue;
        for (int i = 0; i < running.count; i++)
            if (!dependent || running.snapshot[i] == dependent)
                running.snapshot[i] = nullptr;
    }
}

void UpdateHandler::removeFrom(Bucket& bucket, FUnknown* object, IDependent* dependent)
{
    for (int i = bucket.total() - 1; i >= 0; i--)
        if ((!object || bucket[i].object == object) && (!dependent || bucket[i].dependent == dependent))
            bucket.removeAt(i);
}

void UpdateHandler::beginUpdate(Update::Running& running)
{
    FLockScope guard(lock);
    const Bucket& bucket = bucketOf(running.object);
    const int first = bucket.index({running.object, nullptr});
    if (first < 0)
        return;

    for (int i = first; i < bucket.total() && running.count < kMaxDependents; i++)
    {
        if (bucket[i].object != running.object)
            break;
        running.snapshot[running.count++] = bucket[i].dependent;
    }
    updatesInProgress.append(&running);
}

IDependent* UpdateHandler::dependentAt(const Update::Running& running, int index)
{
    FLockScope guard(lock);
    return running.snapshot[index];
}

void UpdateHandler::endUpdate(Update::Running& running)
{
    FLockScope guard(lock);
    updatesInProgress.remove(&running);
}

int32 UpdateHandler::triggerUpdates(FUnknown* object, int message)
{
    // A dependent may give up the object meanwhile.
    const auto identity = adopt(askInterface<FUnknown>(object));
    if (!identity)
        return kUnusableArgument;

    IDependent* snapshot[kMaxDependents];
    Update::Running running{identity, snapshot, 0};
    beginUpdate(running);
    for (int i = 0; i < running.count; i++)
        if (IDependent* dependent = dependentAt(running, i))
            dependent->update(identity, message);
    if (running.count > 0)
        endUpdate(running);
    tellUpdateDone(identity, message);
    return kResultOk;
}

bool UpdateHandler::deferToDependents(FUnknown* object, int message)
{
    FLockScope guard(lock);
    if (bucketOf(object).index({object, nullptr}) < 0)
        return false;
    if (!deferredList.contains({object, message}))
        deferredList.append({object, message});
    return true;
}

int32 UpdateHandler::deferUpdates(FUnknown* object, int message)
{
    FUnknown* identity = identityOf(object);
    if (!identity)
        return kUnusableArgument;
    if (!deferToDependents(identity, message))
        tellUpdateDone(identity, message);
    return kResultOk;
}

int32 UpdateHandler::cancelUpdates(FUnknown* object)
{
    FUnknown* identity = identityOf(object);
    if (!identity)
        return kUnusableArgument;

    Update::DeferedChange dropped;
    while (takeDeferred(identity, dropped))
        ;
    return kResultOk;
}

bool UpdateHandler::takeDeferred(FUnknown* object, Update::DeferedChange& change)
{
    FLockScope guard(lock);
    for (TLinkedListIterator<Update::DeferedChange> it(deferredList); !it.done(); it.next())
        if (!object || it.current().object == object)
        {
            change = it.current();
            deferredList.remove(it);
            return true;
        }
    return false;
}

bool UpdateHandler::isBeingUpdated(FUnknown* object)
{
    for (TLinkedListIterator<Update::Running*> it(updatesInProgress); !it.done(); it.next())
        if (it.current()->object == object)
            return true;
    return false;
}

bool UpdateHandler::postpone(const Update::DeferedChange& change, ChangeList& postponed)
{
    FLockScope guard(lock);
    return isBeingUpdated(change.object) && postponed.append(change);
}

int32 UpdateHandler::triggerDeferedUpdates(FUnknown* object)
{
    FUnknown* identity = identityOf(object);
    if (object && !identity)
        return kUnusableArgument;

    ChangeList postponed;
    Update::DeferedChange change;
    while (takeDeferred(identity, change))
        if (!postpone(change, postponed))
            triggerUpdates(change.object, change.message);

    FLockScope guard(lock);
    for (TLinkedListIterator<Update::DeferedChange> it(postponed); !it.done(); it.next())
        deferredList.append(it.current());
    return kResultOk;
}
