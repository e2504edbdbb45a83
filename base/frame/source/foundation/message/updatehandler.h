#pragma once

#include "containers/typed/tarray.h"
#include "containers/typed/tlinkedlist.h"
#include "foundation/message/iupdatemanager.h"
#include "foundation/object/fobject.h"
#include "foundation/object/iupdatehandler.h"
#include "foundation/thread/flock.h"

#include <functional>

namespace Update
{
/// One row of a bucket. Rows of one object stand together, in the order in which they were added.
struct Dependency
{
    FUnknown* object = nullptr;
    IDependent* dependent = nullptr;

    bool operator<(const Dependency& other) const { return std::less<>()(object, other.object); }
    // By the object alone: it is what the ordered array looks for.
    bool operator==(const Dependency& other) const { return object == other.object; }
};

struct DeferedChange
{
    FUnknown* object = nullptr;
    int message = 0;

    bool operator==(const DeferedChange& other) const = default;
};

/// A running update, with the dependents that it has still to call.
struct Running
{
    FUnknown* object = nullptr;
    IDependent** snapshot = nullptr;
    int count = 0;
};
} // namespace Update

/// Knows who depends on whom, and carries changes to them, at once or at the next pulse.
///
/// An object is known by the pointer that it gives for FUnknown. Nothing here holds a reference: objects and
/// dependents take themselves out before they go. One object tells at most `kMaxDependents`; later ones hear
/// nothing. Thread-safe; dependents are called on the caller's thread, with no lock held.
class UpdateHandler : public FObject, public IUpdateHandler, public IUpdateManager
{
    DECLARE_TYPE(UpdateHandler, FObject)

    static constexpr int kMaxDependents = 10240;

    UpdateHandler();
    ~UpdateHandler() override;

    /// Null after the process-wide objects were torn down.
    static UpdateHandler* instance();

    int32 queryInterface(const char* interfaceID, void** object) override;
    FORWARD_FUNKNOWN(FObject)

    int32 addDependent(FUnknown* object, IDependent* dependent) override;
    /// Null for `object` means all objects of the dependent, and null for `dependent` all dependents of the object.
    /// A running update skips who was removed.
    int32 removeDependent(FUnknown* object, IDependent* dependent) override;
    int32 triggerUpdates(FUnknown* object, int message) override;
    int32 deferUpdates(FUnknown* object, int message) override;
    int32 cancelUpdates(FUnknown* object) override;
    /// A change of an object that is being updated at this moment waits for the next call.
    int32 triggerDeferedUpdates(FUnknown* object) override;

private:
    using Bucket = TOrderedArray<Update::Dependency>;
    using ChangeList = TLinkedList<Update::DeferedChange>;

    Bucket& bucketOf(FUnknown* object);
    void skipInRunningUpdates(FUnknown* object, IDependent* dependent);
    void removeFrom(Bucket& bucket, FUnknown* object, IDependent* dependent);
    bool isBeingUpdated(FUnknown* object);
    void beginUpdate(Update::Running& running);
    IDependent* dependentAt(const Update::Running& running, int index);
    void endUpdate(Update::Running& running);
    bool deferToDependents(FUnknown* object, int message);
    bool takeDeferred(FUnknown* object, Update::DeferedChange& change);
    bool postpone(const Update::DeferedChange& change, ChangeList& postponed);

    FLock lock{"update handler"};
    Bucket dependentTable[256];
    ChangeList deferredList;
    TLinkedList<Update::Running*> updatesInProgress;
};
