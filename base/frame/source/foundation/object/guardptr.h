#pragma once

#include "foundation/object/cmobject.h"

/// A dependent that stands for an `Owner` and is no object itself. One thread at a time.
template <class Owner>
class CmObjectObserverBase : public CmObject
{
    DECLARE_COPYABLE(CmObjectObserverBase, CmObject)

    explicit CmObjectObserverBase(Owner* observed) : owner(observed) {}

protected:
    /// Borrowed: the owner lives longer than its observer.
    Owner* owner;
};

/// Hands the changes that it hears of to `Owner::onUpdate(CmObject* changedObject, int message)`. One thread at a
/// time.
template <class Owner>
class CmObjectUpdateObserver : public CmObjectObserverBase<Owner>
{
    DECLARE_COPYABLE(CmObjectUpdateObserver, CmObjectObserverBase<Owner>)

    using CmObjectObserverBase<Owner>::CmObjectObserverBase;
    using CmObject::update;
    void update(CmObject* changedObject, int message) override
    {
        this->owner->onUpdate(changedObject, message);
    }
};

/// A pointer to an object that clears itself when the object is destroyed. It holds no reference.
///
/// It hears of the end as a dependent of the object, through the process-wide update handler. So it serves objects
/// that announce their end by `changed(kMessageDestroyed)`, and while there is a handler. Main thread.
template <class T>
class GuardPtr
{
public:
    GuardPtr(T* object = nullptr) : observer(new Observer(this)) { set(object); }
    GuardPtr(const GuardPtr& other) : GuardPtr(other.target) {}
    ~GuardPtr()
    {
        set(nullptr);
        observer->release();
    }

    GuardPtr& operator=(T* object)
    {
        set(object);
        return *this;
    }
    GuardPtr& operator=(const GuardPtr& other) { return *this = other.target; }

    T* get() const { return target; }
    T* operator->() const { return target; }
    T& operator*() const { return *target; }
    operator T*() const { return target; }

private:
    using Observer = CmObjectUpdateObserver<GuardPtr<T>>;
    friend Observer;

    void set(T* object);
    void onUpdate(CmObject* changedObject, int message);

    Observer* observer;
    T* target = nullptr;
};

template <class T>
void GuardPtr<T>::set(T* object)
{
    if (target)
        target->removeDependent(observer);
    target = object;
    if (target)
        target->addDependent(observer);
}

template <class T>
void GuardPtr<T>::onUpdate(CmObject*, int message)
{
    if (message == kMessageDestroyed)
        set(nullptr);
}
