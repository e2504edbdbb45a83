#include "foundation/message/updatehandler.h"
#include "foundation/object/cmobject.h"

#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace
{
using Lines = std::vector<std::string>;

Lines gLog;

class Source : public CmObject
{
public:
    void updateDone(int message) override { gLog.push_back("done " + std::to_string(message)); }
};

class Dependent : public CmObject
{
public:
    explicit Dependent(std::string label) : name(std::move(label)) {}
    using CmObject::update;
    void update(FUnknown*, int message) override
    {
        gLog.push_back(name + " " + std::to_string(message));
        if (reaction)
            reaction();
    }

    std::function<void()> reaction;

private:
    std::string name;
};

class UpdateHandlerTest : public testing::Test
{
protected:
    UpdateHandlerTest()
    {
        gLog.clear();
        UpdateHandler::instance();
    }
    ~UpdateHandlerTest() override
    {
        for (Dependent* dependent : {&a, &b, &c})
            UpdateHandler::instance()->removeDependent(nullptr, dependent);
        UpdateHandler::instance()->cancelUpdates(&source);
        UpdateHandler::instance()->cancelUpdates(&other);
    }

    static void drain() { UpdateHandler::instance()->triggerDeferedUpdates(nullptr); }

    Source source, other;
    Dependent a{"a"}, b{"b"}, c{"c"};
};
} // namespace

TEST_F(UpdateHandlerTest, TellsDependentsInOrderAndThenTheObject)
{
    source.addDependent(&a);
    other.addDependent(&c);
    source.addDependent(&b);
    source.changed(7);
    EXPECT_EQ(gLog, (Lines{"a 7", "b 7", "done 7"}));
}

TEST_F(UpdateHandlerTest, NoUpdateDoneFollowsTheEndOfAnObject)
{
    source.changed(1);
    source.changed(kMessageDestroyed);
    source.deferUpdate(3);
    source.deferUpdate(kMessageDestroyed);
    EXPECT_EQ(gLog, (Lines{"done 1", "done 3"})) << "an object without dependents is done at once";
}

TEST_F(UpdateHandlerTest, RefusesUnusableArguments)
{
    UpdateHandler& handler = *UpdateHandler::instance();
    EXPECT_EQ(handler.addDependent(nullptr, &a), 1);
    EXPECT_EQ(handler.addDependent(&source, nullptr), 1);
    EXPECT_EQ(handler.removeDependent(nullptr, nullptr), 1);
    EXPECT_EQ(handler.triggerUpdates(nullptr, 1), 1);
    EXPECT_EQ(handler.deferUpdates(nullptr, 1), 1);
    EXPECT_EQ(handler.cancelUpdates(nullptr), 1);
    EXPECT_EQ(handler.addDependent(&source, &a), 0);
}

TEST_F(UpdateHandlerTest, DeferredChangesOfOneKindCoalesce)
{
    source.addDependent(&a);
    source.deferUpdate(1);
    source.deferUpdate(5);
    source.deferUpdate(1);
    EXPECT_TRUE(gLog.empty());
    drain();
    EXPECT_EQ(gLog, (Lines{"a 1", "done 1", "a 5", "done 5"}));
    drain();
    EXPECT_EQ(gLog.size(), 4u);
}

TEST_F(UpdateHandlerTest, DrainsOneObjectAndForgetsCancelledChanges)
{
    source.addDependent(&a);
    other.addDependent(&b);
    source.deferUpdate(1);
    other.deferUpdate(1);
    other.deferUpdate(3);
    UpdateHandler::instance()->triggerDeferedUpdates(&other);
    EXPECT_EQ(gLog, (Lines{"b 1", "done 1", "b 3", "done 3"}));
    UpdateHandler::instance()->cancelUpdates(&source);
    drain();
    EXPECT_EQ(gLog.size(), 4u);
}

TEST_F(UpdateHandlerTest, SkipsADependentThatIsRemovedDuringTheUpdate)
{
    for (Dependent* dependent : {&a, &b, &c})
        source.addDependent(dependent);
    a.reaction = [this] { source.removeDependent(&b); };
    source.changed(1);
    EXPECT_EQ(gLog, (Lines{"a 1", "c 1", "done 1"}));

    gLog.clear();
    a.reaction = [this] { UpdateHandler::instance()->removeDependent(nullptr, &c); };
    source.changed(1);
    EXPECT_EQ(gLog, (Lines{"a 1", "done 1"}));

    gLog.clear();
    source.addDependent(&b);
    a.reaction = [this] { UpdateHandler::instance()->removeDependent(&source, nullptr); };
    source.changed(1);
    source.changed(3);
    EXPECT_EQ(gLog, (Lines{"a 1", "done 1", "done 3"}));
}

TEST_F(UpdateHandlerTest, ADependentAddedDuringTheUpdateHearsOfTheNextOne)
{
    source.addDependent(&a);
    a.reaction = [this]
    {
        a.reaction = nullptr;
        source.addDependent(&b);
    };
    source.changed(1);
    source.changed(3);
    EXPECT_EQ(gLog, (Lines{"a 1", "done 1", "a 3", "b 3", "done 3"}));
}

TEST_F(UpdateHandlerTest, AChangeOfAnObjectBeingUpdatedWaitsForTheNextDrain)
{
    source.addDependent(&a);
    other.addDependent(&b);
    source.deferUpdate(1);
    a.reaction = [this]
    {
        a.reaction = nullptr;
        source.deferUpdate(5);
        other.deferUpdate(6);
        drain();
        gLog.push_back("inner drain over");
    };
    source.changed(3);
    EXPECT_EQ(gLog, (Lines{"a 3", "b 6", "done 6", "inner drain over", "done 3"}));
    gLog.clear();
    drain();
    EXPECT_EQ(gLog, (Lines{"a 1", "done 1", "a 5", "done 5"}));
}

TEST_F(UpdateHandlerTest, WhatArrivesDuringADrainBelongsToIt)
{
    source.addDependent(&a);
    other.addDependent(&b);
    a.reaction = [this] { other.deferUpdate(9); };
    source.deferUpdate(1);
    drain();
    EXPECT_EQ(gLog, (Lines{"a 1", "done 1", "b 9", "done 9"}));
}

TEST_F(UpdateHandlerTest, KnowsAnObjectThroughAnyOfItsInterfaces)
{
    struct TwoFaced : CmObject, IUpdateManager
    {
        int32 cancelUpdates(FUnknown*) override { return 0; }
        int32 triggerDeferedUpdates(FUnknown*) override { return 0; }
        int32 queryInterface(const char* interfaceID, void** object) override
        {
            return CmObject::queryInterface(interfaceID, object);
        }
        FORWARD_FUNKNOWN(CmObject)
    } object;
    UpdateHandler& handler = *UpdateHandler::instance();
    handler.addDependent(static_cast<IUpdateManager*>(&object), &a);
    object.changed(1);
    EXPECT_EQ(gLog, (Lines{"a 1"}));
    EXPECT_EQ(object.getRefCount(), 1u) << "no reference is held";
}

TEST_F(UpdateHandlerTest, TellsNoMoreThanTheLimit)
{
    struct Counter : CmObject
    {
        using CmObject::update;
        void update(FUnknown*, int) override { count++; }
        int count = 0;
    } counter;
    for (int i = 0; i < UpdateHandler::kMaxDependents + 5; i++)
        source.addDependent(&counter);
    source.changed(1);
    EXPECT_EQ(counter.count, UpdateHandler::kMaxDependents);
    source.removeDependent(&counter);
    source.changed(1);
    EXPECT_EQ(counter.count, UpdateHandler::kMaxDependents) << "all its pairs are gone";
}

TEST_F(UpdateHandlerTest, KeepsAnObjectThatADependentGivesUp)
{
    auto* shared = new Source;
    shared->addDependent(&a);
    a.reaction = [&]
    {
        shared->removeDependent(&a);
        shared->release();
    };
    shared->changed(1);
    EXPECT_EQ(gLog, (Lines{"a 1", "done 1"}));
}
