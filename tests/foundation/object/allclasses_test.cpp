// Walks over every class that the program registers: a declaration that was forgotten or copied shows here.

#include "containers/value/idate.h"
#include "containers/value/itime.h"
#include "foundation/message/fmessenger.h"
#include "foundation/message/imessage.h"
#include "foundation/object/classfactory.h"
#include "foundation/object/cmobject.h"
#include "foundation/object/iptr.h"
#include "storage/path/ipath.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <cxxabi.h>
#include <memory>
#include <string>
#include <typeinfo>

namespace
{
/// The language's own name of the object's class, without its namespaces.
std::string languageName(const CmObject& object)
{
    int status = 0;
    const std::unique_ptr<char, void (*)(void*)> text(
        abi::__cxa_demangle(typeid(object).name(), nullptr, nullptr, &status), &free);
    const std::string name = text ? text.get() : "";
    const size_t colon = name.rfind("::");
    return colon == std::string::npos ? name : name.substr(colon + 2);
}

TArray<const MetaClass*> classes(bool named)
{
    TArray<const MetaClass*> all, result;
    ClassFactory::instance(true)->listClasses(all);
    for (const MetaClass* meta : all)
        if ((meta->className != nullptr) == named)
            result.add(meta);
    return result;
}

/// Whether the factory has, for this identifier alone, a descriptor whose objects offer the interface.
bool isMadeByIdentifier(const MetaClass& meta)
{
    const FUID& iid = meta.classID;
    const IPtr<FUnknown> object = adopt(ClassFactory::instance(true)->createObjectByID(iid));
    void* view = nullptr;
    if (!object || object->queryInterface(iid, &view) != kResultOk)
        return false;
    return view == object.get() && object->release() == 1;
}

void expectDeclaredAs(CmObject& object, const MetaClass& meta)
{
    EXPECT_EQ(languageName(object), object.isA());
    EXPECT_TRUE(object.isA(object.isA()));
    EXPECT_TRUE(object.isTypeOf("CmObject", true));
    EXPECT_FALSE(object.isTypeOf("", true));

    const MetaClass* own = object.getClass();
    EXPECT_STREQ(own->className, object.isA());
    // An older name's descriptor makes the class that took its place.
    EXPECT_TRUE(own == &meta || strcmp(own->persistentName, meta.className) == 0);
    for (const MetaClass* base = own->baseClass; base; base = base->baseClass)
    {
        EXPECT_TRUE(object.isTypeOf(base->className, true)) << base->className;
        EXPECT_FALSE(object.isA(base->className)) << base->className;
    }
}

void expectCopiesToItsOwnClass(const CmObject& object)
{
    const IPtr<CmObject> copied = adopt(object.newCopy());
    ASSERT_TRUE(copied);
    const CmObject& copy = *copied;
    EXPECT_TRUE(typeid(copy) == typeid(object)) << "copied as " << copy.isA();
    EXPECT_EQ(copy.getRefCount(), 1u);
}
} // namespace

TEST(AllClasses, AreWhatTheySay)
{
    int made = 0;
    for (const MetaClass* meta : classes(true))
    {
        SCOPED_TRACE(meta->className);
        const IPtr<FUnknown> unknown = adopt(meta->createFunction ? meta->createFunction() : nullptr);
        if (!unknown)
            continue;
        CmObject* object = toCmObject(unknown);
        ASSERT_TRUE(object) << "not a CmObject";
        EXPECT_EQ(object->getRefCount(), 1u);
        expectDeclaredAs(*object, *meta);
        expectCopiesToItsOwnClass(*object);
        made++;
    }
    EXPECT_GT(made, 20) << "the classes must be linked and registered";
}

TEST(AllClasses, HaveNamesOfTheirOwn)
{
    for (const MetaClass* meta : classes(true))
    {
        SCOPED_TRACE(meta->className);
        EXPECT_EQ(ClassFactory::instance(true)->getMetaClassByName(meta->className), meta)
            << "registered twice";
        EXPECT_TRUE(meta->createFunction || meta->baseClass);
        EXPECT_TRUE(meta->isTypeOf(meta->className));
    }
}

TEST(AllClasses, AreMadeByTheInterfaceThatTheyStandFor)
{
    TArray<FUID> fresh;
    for (const FUID* iid : {&IDate::iid, &ITime::iid, &IPath::iid, &IMessage::iid})
        fresh.add(*iid);
    int made = 0;
    for (const MetaClass* meta : classes(false))
    {
        EXPECT_TRUE(meta->classID.isValid() && !meta->baseClass && meta->classVersion == 0);
        if (!fresh.contains(meta->classID))
            continue;
        EXPECT_TRUE(isMadeByIdentifier(*meta)) << made;
        made++;
    }
    EXPECT_EQ(made, fresh.total());
}

TEST(AllClasses, HandOutTheOneServiceOfTheProcess)
{
    const ClassFactory& factory = *ClassFactory::instance(true);
    EXPECT_EQ(factory.createObjectByID(IMessenger::iid), nullptr) << "while there is none";
    FMessenger messenger;
    gMessenger = &messenger;
    const IPtr<FUnknown> service = adopt(factory.createObjectByID(IMessenger::iid));
    gMessenger = nullptr;
    EXPECT_EQ(service.get(), static_cast<IMessenger*>(&messenger));
    EXPECT_EQ(messenger.getRefCount(), 2u);
}
