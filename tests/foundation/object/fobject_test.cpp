#include "foundation/object/cmuid.h"
#include "foundation/object/fatomic.h"
#include "foundation/object/guardptr.h"
#include "foundation/object/iptr.h"
#include "foundation/object/iupdatehandler.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <thread>
#include <vector>

namespace
{
/// Reports its own end, and what its count was then.
class Mortal : public CmObject
{
    DECLARE_COPYABLE(Mortal, CmObject)

    explicit Mortal(int* countAtEnd) : report(countAtEnd) {}
    ~Mortal() override
    {
        if (report)
            *report = static_cast<int>(getRefCount());
        addRef();
        release();
    }

    int* report;
};

/// Says that it goes.
class Announcing : public CmObject
{
    DECLARE_COPYABLE(Announcing, CmObject)

    Announcing() = default;
    ~Announcing() override { changed(kMessageDestroyed); }
};

/// Notes what it hears.
class Listener : public CmObject
{
    DECLARE_COPYABLE(Listener, CmObject)

    using CmObject::update;
    void update(CmObject* changedObject, int message) override
    {
        lastObject = changedObject;
        lastMessage = message;
    }
    void updateDone(int message) override { doneMessage = message; }

    CmObject* lastObject = nullptr;
    int lastMessage = 0;
    int doneMessage = 0;
};

/// A handler that tells changes at once, from a plain list of pairs.
class SimpleHandler : public FObject, public IUpdateHandler
{
    DECLARE_TYPE(SimpleHandler, FObject)
    FORWARD_FUNKNOWN(FObject)

    SimpleHandler() { gUpdateHandler = this; }
    ~SimpleHandler() override { gUpdateHandler = nullptr; }

    int32 queryInterface(const char* interfaceID, void** object) override
    {
        return FObject::queryInterface(interfaceID, object);
    }
    int32 addDependent(FUnknown* object, IDependent* dependent) override
    {
        pairs.push_back({object, dependent});
        return 0;
    }
    int32 removeDependent(FUnknown* object, IDependent* dependent) override
    {
        std::erase(pairs, Pair{object, dependent});
        return 0;
    }
    int32 triggerUpdates(FUnknown* object, int message) override
    {
        triggered.push_back(message);
        const std::vector<Pair> snapshot = pairs;
        for (const Pair& pair : snapshot)
            if (pair.object == object)
                pair.dependent->update(object, message);
        return 0;
    }
    int32 deferUpdates(FUnknown*, int message) override
    {
        deferred.push_back(message);
        return 0;
    }

    struct Pair
    {
        bool operator==(const Pair&) const = default;
        FUnknown* object;
        IDependent* dependent;
    };
    std::vector<Pair> pairs;
    std::vector<int> triggered;
    std::vector<int> deferred;
};
} // namespace

TEST(FObject, CountsReferencesAndMarksTheDying)
{
    int countAtEnd = 0;
    auto* object = new Mortal(&countAtEnd);
    EXPECT_EQ(object->getRefCount(), 1u);
    EXPECT_EQ(object->addRef(), 2u);
    EXPECT_EQ(object->release(), 1u);
    EXPECT_EQ(object->release(), 0u);
    EXPECT_EQ(countAtEnd, -1000) << "a release by the destructor must not delete twice";
}

TEST(FObject, CountsFromManyThreads)
{
    CmObject object;
    std::vector<std::thread> threads;
    for (int i = 0; i < 4; i++)
        threads.emplace_back(
            [&object]
            {
                for (int k = 0; k < 10000; k++)
                {
                    object.addRef();
                    object.release();
                }
                object.addRef();
            });
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(object.getRefCount(), 5u);
}

TEST(FObject, AnswersTheTypeTest)
{
    CmUID uid;
    const FObject& object = uid;
    EXPECT_STREQ(object.isA(), "CmUID");
    EXPECT_TRUE(object.isA("CmUID"));
    EXPECT_FALSE(object.isA("CmObject"));
    EXPECT_TRUE(object.isTypeOf("CmObject", true));
    EXPECT_TRUE(object.isTypeOf("FObject", true));
    EXPECT_FALSE(object.isTypeOf("CmObject", false));
    EXPECT_FALSE(object.isTypeOf("CmUI", true));
    EXPECT_FALSE(object.isA(nullptr));
    EXPECT_FALSE(object.isTypeOf(nullptr, true));
    EXPECT_FALSE(CmUID::__fClass.isTypeOf(nullptr));
    EXPECT_TRUE(CmUID::__fClass.isTypeOf("CmObject"));
    EXPECT_EQ(FCast(CmUID, static_cast<CmObject*>(&uid)), &uid);
    EXPECT_EQ(FCast(Mortal, static_cast<CmObject*>(&uid)), nullptr);
}

TEST(FObject, GivesItsInterfacesWithAReference)
{
    CmObject object;
    for (const FUID* iid : {&FUnknown::iid, &IDependent::iid, &FObject::iid})
    {
        void* view = nullptr;
        EXPECT_EQ(object.queryInterface(*iid, &view), 0);
        EXPECT_EQ(view, static_cast<FObject*>(&object));
    }
    EXPECT_EQ(object.getRefCount(), 4u);
    void* view = &object;
    EXPECT_EQ(object.queryInterface(IUpdateHandler::iid, &view), -1);
    EXPECT_EQ(view, nullptr);
    EXPECT_EQ(toFObject(&object), &object);
    EXPECT_EQ(object.getRefCount(), 4u) << "a type test keeps no reference";
}

TEST(FObject, FinishesItsChangesItselfWithoutAHandler)
{
    ASSERT_EQ(FObject::gUpdateHandler, nullptr);
    Listener object;
    object.changed(7);
    EXPECT_EQ(object.doneMessage, 7);
    object.deferUpdate(8);
    EXPECT_EQ(object.doneMessage, 8);
    object.addDependent(&object);
    object.removeDependent(&object);
}

TEST(FObject, HandsItsChangesToTheHandler)
{
    SimpleHandler handler;
    Listener listener;
    CmObject object;
    object.addDependent(&listener);
    object.changed(5);
    EXPECT_EQ(listener.lastObject, &object);
    EXPECT_EQ(listener.lastMessage, 5);
    object.deferUpdate(6);
    EXPECT_EQ(handler.deferred, (std::vector<int>{6}));
    object.removeDependent(&listener);
    object.changed(9);
    EXPECT_EQ(listener.lastMessage, 5);
    EXPECT_EQ(object.getRefCount(), 1u) << "update borrows what changed";
}

TEST(CmObject, ComparesByAddress)
{
    CmObject objects[2];
    EXPECT_TRUE(objects[0].isEqual(&objects[0]));
    EXPECT_FALSE(objects[0].isEqual(&objects[1]));
    EXPECT_EQ(objects[0].compare(&objects[0]), 0);
    EXPECT_EQ(objects[0].compare(&objects[1]), -1);
    EXPECT_EQ(objects[1].compare(&objects[0]), 1);
    EXPECT_EQ(objects[0].hash(7), (reinterpret_cast<uintptr_t>(&objects[0]) >> 4) % 7);
}

TEST(CmObject, CopiesStartTheirOwnCount)
{
    CmUID uid;
    uid.generate();
    uid.addRef();
    const IPtr<CmObject> copied = adopt(uid.newCopy());
    EXPECT_EQ(copied->getRefCount(), 1u);
    EXPECT_TRUE(copied->isA("CmUID"));
    EXPECT_TRUE(copied->isEqual(&uid));
}

TEST(FAtomic, GivesTheValueBefore)
{
    volatile int value = 5;
    EXPECT_EQ(FAtomicIncrement(value), 5);
    EXPECT_EQ(FAtomicDecrement(value), 6);
    EXPECT_EQ(FAtomicAdd(value, 10), 5);
    EXPECT_FALSE(FAtomicCompareAndSwap(value, 5, 1));
    EXPECT_TRUE(FAtomicCompareAndSwap(value, 15, 1));
    EXPECT_EQ(value, 1);
    int plain = 3;
    EXPECT_EQ(FUnknown::atomicAdd(plain, 4), 7) << "this one gives the new value";
}

TEST(IPtr, HoldsOneReference)
{
    CmObject object;
    {
        IPtr<CmObject> first(&object);
        const IPtr<CmObject> second(first);
        EXPECT_EQ(object.getRefCount(), 3u);
        first = nullptr;
        EXPECT_EQ(object.getRefCount(), 2u);
        first = second;
        first = first.get();
        EXPECT_EQ(object.getRefCount(), 3u);
        CmObject* taken = first.take();
        EXPECT_EQ(object.getRefCount(), 3u);
        EXPECT_EQ(first.get(), nullptr);
        taken->release();
    }
    EXPECT_EQ(object.getRefCount(), 1u);
}

TEST(GuardPtr, ForgetsATargetThatDies)
{
    SimpleHandler handler;
    CmObject target, other;
    GuardPtr<CmObject> guard(&target);
    GuardPtr<CmObject> copied(guard);
    EXPECT_EQ(handler.pairs.size(), 2u);
    EXPECT_EQ(target.getRefCount(), 1u);
    target.changed(1);
    EXPECT_EQ(guard.get(), &target) << "other messages mean nothing to it";
    copied = &other;
    target.changed(kMessageDestroyed);
    EXPECT_EQ(guard.get(), nullptr);
    EXPECT_EQ(copied.get(), &other);
    EXPECT_EQ(handler.pairs.size(), 1u);
    copied = nullptr;
    EXPECT_TRUE(handler.pairs.empty());
}

TEST(GuardPtr, ReadsNullAfterTheEndOfItsTarget)
{
    SimpleHandler handler;
    auto* target = new Announcing;
    const GuardPtr<CmObject> guard(target);
    target->addRef();
    target->release();
    EXPECT_EQ(guard.get(), target);
    target->release();
    EXPECT_EQ(guard.get(), nullptr);
}

TEST(GuardPtr, LeavesNoDependencyBehind)
{
    SimpleHandler handler;
    CmObject target;
    {
        const GuardPtr<CmObject> guard(&target);
    }
    EXPECT_TRUE(handler.pairs.empty());
    target.changed(kMessageDestroyed);
}
