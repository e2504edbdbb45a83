#include "foundation/object/classfactory.h"
#include "foundation/object/cmdelegatingunknown.h"
#include "foundation/object/cmuid.h"
#include "foundation/object/fmodule.h"
#include "foundation/object/ipersistent.h"
#include "foundation/object/iptr.h"
#include "foundation/object/singleton.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <string>

namespace
{
const FUID kComponentID(0x5EED0001, 0x11112222, 0x33334444, 0x55556666);

/// Keeps the text that it is given.
class TextResult : public FObject, public IString
{
    DECLARE_TYPE(TextResult, FObject)
    FORWARD_FUNKNOWN(FObject)

    int32 queryInterface(const char* interfaceID, void** object) override
    {
        return FObject::queryInterface(interfaceID, object);
    }
    void setText8(const char* newText) override { text = newText; }
    void setText16(const char16*) override {}
    const char* getText8() override { return text.c_str(); }
    const char16* getText16() override { return nullptr; }
    void take(void*, bool) override {}
    bool isWideString() const override { return false; }

    std::string text;
};

/// An object of a component: no FObject, known by its identifier alone.
class Component : public IPersistent
{
public:
    virtual ~Component() = default;
    int32 queryInterface(const char* interfaceID, void** object) override
    {
        if (isSameInterface(interfaceID, IPersistent::iid))
            return offerInterface<IPersistent>(this, object);
        *object = nullptr;
        return kNoInterface;
    }
    uint32 addRef() override { return ++references; }
    uint32 release() override
    {
        if (--references > 0)
            return references;
        delete this;
        return 0;
    }
    int32 getClassID(char* uid) override
    {
        classID.toTUID(uid);
        return hasClassID ? kResultOk : kNoInterface;
    }
    int32 saveAttributes(IAttributes*) override { return kResultOk; }
    int32 loadAttributes(IAttributes*) override { return kResultOk; }

    uint32 references = 1;
    FUID classID = kComponentID;
    bool hasClassID = true;
};

FUnknown* makeComponent()
{
    return new Component;
}

/// A class of the test, which is also found by an older name.
class Renamed : public CmObject
{
    DECLARE_CLASS(Renamed, CmObject)
};
DEFINE_CLASS_VERSION(Renamed, CmObject, 3)
MetaClass renamedAlias(&Renamed::__fClass, "Renamed Before");

class Abstract : public CmObject
{
    DECLARE_ABSTRACT_CLASS(Abstract, CmObject)
};
DEFINE_ABSTRACT_CLASS(Abstract, CmObject)

class Undescribed : public CmObject
{
    DECLARE_COPYABLE(Undescribed, CmObject)
};

/// Answers for a component as well.
class UndescribedComponent : public Undescribed
{
    DECLARE_COPYABLE(UndescribedComponent, Undescribed)

    int32 queryInterface(const char* interfaceID, void** object) override
    {
        if (isSameInterface(interfaceID, IPersistent::iid))
        {
            *object = static_cast<IPersistent*>(new Component);
            return kResultOk;
        }
        return Undescribed::queryInterface(interfaceID, object);
    }
};

MetaClass componentClass(nullptr, makeComponent, kComponentID, nullptr, 0);
MetaClass unfindable("Unfindable Class", nullptr, nullptr, nullptr, 0);

ClassFactory& factory()
{
    return *ClassFactory::instance(false);
}

class CountingModule : public FModule
{
public:
    void addInstance(FUnknown*) override { instances++; }
    void releaseInstance(FUnknown*) override
    {
        instances--;
        EXPECT_TRUE(!component || component->references == 1) << "the delegate goes while its code is there";
    }

    int instances = 0;
    const Component* component = nullptr;
};
} // namespace

TEST(ClassFactory, MakesObjectsByName)
{
    const IPtr<FUnknown> made = adopt(factory().createObjectByName("CmUID"));
    ASSERT_TRUE(made);
    FObject* object = toFObject(made);
    EXPECT_TRUE(object->isA("CmUID"));
    EXPECT_EQ(object->getRefCount(), 1u);
    EXPECT_EQ(factory().createObjectByName("No Such Class"), nullptr);
    EXPECT_EQ(factory().createObjectByName(nullptr), nullptr);
}

TEST(ClassFactory, FindsAnAbstractClassButMakesNone)
{
    EXPECT_EQ(factory().getMetaClassByName("Abstract"), &Abstract::__fClass);
    EXPECT_EQ(factory().createObjectByName("Abstract"), nullptr);
    EXPECT_EQ(factory().getMetaClassByName("Unfindable Class"), nullptr);
}

TEST(ClassFactory, MakesObjectsByIdentifier)
{
    EXPECT_EQ(factory().getMetaClassByID(kComponentID), &componentClass);
    for (FUnknown* made : {factory().createObjectByID(kComponentID),
                           factory().createObjectByName("5EED0001111122223333444455556666")})
    {
        ASSERT_TRUE(made);
        EXPECT_EQ(made->release(), 0u);
    }
    EXPECT_EQ(factory().createObjectByName("5EED000111112222333344445555666"), nullptr);
    EXPECT_EQ(factory().createObjectByName("00000000000000000000000000000000"), nullptr);
    EXPECT_EQ(factory().createObjectByID(FUID(1, 2, 3, 4)), nullptr);
    EXPECT_EQ(factory().getMetaClassByID(FUID()), nullptr) << "no identifier is none";
}

TEST(ClassFactory, AliasStandsForItsTarget)
{
    EXPECT_STREQ(Renamed::__fClass.persistentName, "Renamed Before");
    EXPECT_EQ(Renamed::__fClass.classVersion, 3);
    EXPECT_EQ(renamedAlias.classVersion, 0);
    EXPECT_EQ(renamedAlias.baseClass, nullptr);
    const IPtr<FUnknown> made = adopt(factory().createObjectByName("Renamed Before"));
    ASSERT_TRUE(made);
    EXPECT_TRUE(toFObject(made)->isA("Renamed"));
}

TEST(ClassFactory, UnregistersThisVeryDescriptor)
{
    MetaClass twin("Renamed", nullptr, FUID(9, 9, 9, 9), &CmObject::__fClass, 0);
    EXPECT_EQ(factory().getMetaClassByName("Renamed"), &Renamed::__fClass)
        << "the first one of a name counts";
    EXPECT_EQ(factory().getMetaClassByID(FUID(9, 9, 9, 9)), &twin);
    factory().unregisterMetaClass(&twin);
    EXPECT_EQ(factory().getMetaClassByID(FUID(9, 9, 9, 9)), nullptr);
    EXPECT_EQ(factory().getMetaClassByName("Renamed"), &Renamed::__fClass);
}

TEST(ClassFactory, NamesStoredObjects)
{
    TextResult result;
    Renamed renamed;
    EXPECT_FALSE(factory().getStorageID(nullptr, result, false));
    EXPECT_TRUE(factory().getStorageID(&renamed, result, false));
    EXPECT_EQ(result.text, "Renamed");
    EXPECT_TRUE(factory().getStorageID(&renamed, result, true));
    EXPECT_EQ(result.text, "Renamed Before");
    Undescribed undescribed;
    EXPECT_TRUE(factory().getStorageID(&undescribed, result, false));
    EXPECT_FALSE(factory().getStorageID(&undescribed, result, true));
    EXPECT_EQ(renamed.getRefCount(), 1u);
}

TEST(ClassFactory, NamesComponentsByTheirIdentifier)
{
    TextResult result;
    Component component;
    EXPECT_TRUE(factory().getStorageID(&component, result, true));
    EXPECT_EQ(result.text, "5EED0001111122223333444455556666");

    // An FObject that the factory doesn't know by name is still known by its identifier.
    UndescribedComponent undescribed;
    EXPECT_TRUE(factory().getStorageID(&undescribed, result, false));
    EXPECT_EQ(result.text, "UndescribedComponent");
    EXPECT_TRUE(factory().getStorageID(&undescribed, result, true));
    EXPECT_EQ(result.text, "5EED0001111122223333444455556666");

    component.classID = FUID(1, 2, 3, 4);
    EXPECT_FALSE(factory().getStorageID(&component, result, true)) << "nobody could make it";
    EXPECT_TRUE(factory().getStorageID(&component, result, false));
    EXPECT_EQ(result.text, "00000001000000020000000300000004");
    component.hasClassID = false;
    EXPECT_FALSE(factory().getStorageID(&component, result, false));
    EXPECT_EQ(component.references, 1u);
}

TEST(CmDelegatingUnknown, AnswersForItsDelegate)
{
    auto* component = new Component;
    {
        CmDelegatingUnknown wrapper(component, nullptr);
        EXPECT_EQ(component->references, 2u);
        const IPtr<IPersistent> view = adopt(askInterface<IPersistent>(&wrapper));
        EXPECT_EQ(view.get(), component);
        EXPECT_EQ(toFObject(&wrapper), nullptr) << "a wrapper has no identity of its own";
        const IPtr<CmObject> copied = adopt(wrapper.newCopy());
        EXPECT_EQ(component->references, 4u);
    }
    EXPECT_EQ(component->release(), 0u);

    CmDelegatingUnknown empty;
    EXPECT_EQ(toCmObject(&empty), &empty);
}

TEST(CmDelegatingUnknown, EqualsByModuleAndHoldsIt)
{
    CountingModule module, otherModule;
    {
        Component first, second;
        const CmDelegatingUnknown one(&first, &module), two(&second, &module), third(&first, &otherModule);
        EXPECT_EQ(module.instances, 2);
        EXPECT_TRUE(one.isEqual(&two));
        EXPECT_EQ(one.hash(31), two.hash(31));
        EXPECT_FALSE(one.isEqual(&third));
        const CmDelegatingUnknown copied(one), otherCopy(third);
        EXPECT_EQ(module.instances, 2) << "a copy doesn't hold the module";
        EXPECT_TRUE(copied.isEqual(&otherCopy));
        const CmObject object;
        EXPECT_FALSE(one.isEqual(&object));
    }
    EXPECT_EQ(module.instances, 0);
    EXPECT_EQ(otherModule.instances, 0);
    Component last;
    module.component = &last;
    CmDelegatingUnknown(&last, &module);
}

namespace
{
/// Says on standard error that it goes, and whether it could still get the factory.
class LastWords : public FObject
{
    DECLARE_TYPE(LastWords, FObject)

    explicit LastWords(const char* itsText) : text(itsText) {}
    ~LastWords() override
    {
        fprintf(stderr, "%s %s %s;", text, Singleton::isTerminated() ? "late" : "early",
                ClassFactory::instance(true) ? "factory" : "none");
    }

    const char* text;
};

FObject* firstMade = nullptr;
FObject* secondMade = nullptr;

void leaveSingletonsAndExit()
{
    firstMade = new LastWords("first");
    Singleton::registerInstance(&firstMade);
    secondMade = new LastWords("second");
    Singleton::registerInstance(&secondMade);
    exit(0);
}
} // namespace

TEST(SingletonDeathTest, GoInTheOrderInWhichTheyWereMade)
{
    // The factory is older than both, so it is gone by then and can't be made again.
    EXPECT_EXIT(leaveSingletonsAndExit(), testing::ExitedWithCode(0), "first late none;second late none;");
}
