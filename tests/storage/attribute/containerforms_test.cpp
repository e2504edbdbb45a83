#include "containers/keyed/cmhashdictionary.h"
#include "containers/sequence/cmarray.h"
#include "containers/sequence/cmlinkedlist.h"
#include "foundation/object/cmdelegatingunknown.h"
#include "foundation/object/cmuid.h"
#include "foundation/object/fmodule.h"
#include "foundation/object/ipersistent.h"
#include "foundation/object/iptr.h"
#include "foundation/text/cmstring.h"
#include "services/components/fcomponentregistry.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/fnewarchive.h"
#include "storage/attribute/fobjectlist.h"
#include "storage/attribute/fxmlinstance.h"
#include "storage/attribute/fxmlreference.h"
#include "storage/stream/fmemorystream.h"
#include "tests/storage/objectfixture.h"

#include <gtest/gtest.h>

#include <cstring>
#include <string>

namespace
{
std::string textsOf(const CmContainer& container)
{
    std::string result;
    for (int i = 0; i < container.total(); i++)
        result += std::string(static_cast<CmString*>(container.at(i))->text8()) + ";";
    return result;
}

void fill(CmContainer& container)
{
    container.takeElements();
    for (const char* text : {"one", "two", "three"})
        container.add(new CmString(text));
}

/// Stores `object` in the older archive and reads it back; null where either fails.
IPtr<CmObject> throughArchive(const CmObject& object)
{
    FMemoryStream stream;
    {
        FNewArchive archive(&stream, true);
        if (!archive.writeObject(&object, true))
            return nullptr;
    }
    stream.rewind();
    FNewArchive archive(&stream, false);
    return adopt(archive.readObject(object.isA(), true));
}

/// Fills `target` with what `object` stores of itself.
bool throughAttributes(const CmObject& object, CmObject& target)
{
    FAttributes attributes;
    return object.storeAttributes(attributes) && target.restoreAttributes(attributes);
}

/// An array as an archive has it until somebody asks for it.
IPtr<FXmlInstance> storedArray()
{
    auto tree = adopt(new FAttributes);
    tree->set("ownership", CmContainer::kTaken);
    return adopt(new FXmlInstance(1, "CmArray", tree));
}

void addReference(const FXmlInstance& from, FXmlInstance& to)
{
    auto* reference = new FXmlReference(to.getID());
    reference->setTarget(&to, false);
    from.getStoredAttributes()->queueObject("obj", reference, true);
}
} // namespace

TEST(CmObjectForms, StoreNothing)
{
    CmObject object;
    FAttributes attributes;
    EXPECT_FALSE(object.storeAttributes(attributes));
    EXPECT_FALSE(object.restoreAttributes(attributes));
    FMemoryStream stream;
    FNewArchive archive(&stream, true);
    const int64 size = stream.getSize();
    EXPECT_TRUE(object.externalize(archive));
    EXPECT_TRUE(object.internalize(archive));
    EXPECT_EQ(stream.getSize(), size);
}

TEST(ContainerForms, ComeBackWithModeAndElements)
{
    CmArray array;
    fill(array);
    const IPtr<CmObject> read = throughArchive(array);
    const CmArray* restored = FCast(CmArray, static_cast<const CmObject*>(read.get()));
    ASSERT_TRUE(restored);
    EXPECT_EQ(textsOf(*restored), "one;two;three;");
    EXPECT_EQ(restored->getOwnership(), 1);
    EXPECT_EQ(restored->at(0)->getRefCount(), 1u);
}

TEST(ContainerForms, GoThroughAttributes)
{
    CmArray array;
    fill(array);
    CmLinkedList restored;
    EXPECT_TRUE(throughAttributes(array, restored));
    EXPECT_EQ(textsOf(restored), "one;two;three;");
    EXPECT_EQ(restored.getOwnership(), 1);

    FAttributes attributes;
    array.shareElements();
    array.storeAttributes(attributes);
    EXPECT_FALSE(attributes.containsAttribute("ownership"));
    EXPECT_EQ(attributes.countQueueItems("obj"), 3);
    array.takeElements();
}

TEST(ContainerForms, KeepWhatCouldBeReadOfATornFile)
{
    CmArray array;
    fill(array);
    FMemoryStream whole;
    FNewArchive writing(&whole, true);
    ASSERT_TRUE(array.externalize(writing));
    for (int64 length = 0; length < whole.getSize(); length++)
    {
        std::string bytes(static_cast<const char*>(whole.getData()), static_cast<size_t>(length));
        FMemoryStream torn(bytes.data(), length);
        FNewArchive reading(&torn, false);
        CmArray restored;
        EXPECT_FALSE(restored.internalize(reading)) << length;
        EXPECT_EQ(std::string("one;two;three;").find(textsOf(restored)), 0u);
        EXPECT_EQ(restored.getOwnership(), length < 2 ? 0 : 1);
    }
}

TEST(ContainerForms, HoldNothingThatLeadsBackToThem)
{
    const int before = StoredNode::alive;
    {
        const auto first = storedArray(), second = storedArray(), third = storedArray();
        addReference(*first, *first);
        first->getStoredAttributes()->queueObject("obj", new StoredNode, true);
        for (FXmlInstance* element : {second.get(), third.get()})
            addReference(*first, *element);
        addReference(*second, *first);
        addReference(*third, *second);
        const auto* array = FCast(CmArray, first->getObject("CmArray"));
        ASSERT_TRUE(array);
        EXPECT_EQ(array->total(), 1) << "the third leads to the first by the second";
        EXPECT_TRUE(FCast(StoredNode, array->at(0)));
        EXPECT_EQ(FCast(CmArray, third->getObject("CmArray"))->total(), 1) << "but closes no circle itself";
    }
    {
        const auto node = adopt(new StoredNode);
        CmArray array;
        array.takeElements();
        FObjectList list;
        FAttributes tree;
        CmAssociation pair(node, &pair);
        for (CmObject* element : {static_cast<CmObject*>(node.get()), static_cast<CmObject*>(&array)})
            array.add(element);
        for (CmObject* element : {static_cast<CmObject*>(node.get()), static_cast<CmObject*>(&list)})
            list.queue(element, false);
        tree.setObject("node", node);
        tree.setObject("tree", &tree);
        for (const CmObject* object : std::initializer_list<CmObject*>{&array, &list, &tree, &pair})
            EXPECT_EQ(throughArchive(*object), nullptr) << object->isA();
        array.shareElements();
        tree.removeAll();
    }
    EXPECT_EQ(StoredNode::alive, before) << "a circle would never be released";
}

TEST(ContainerForms, BaseIsTheModeAlone)
{
    CmArray array, restored;
    array.retainElements();
    FMemoryStream stream;
    EXPECT_TRUE(array.writeBase(stream));
    EXPECT_EQ(stream.getSize(), 2);
    stream.rewind();
    EXPECT_TRUE(restored.readBase(stream));
    EXPECT_EQ(restored.getOwnership(), 2);
    EXPECT_FALSE(restored.readBase(stream));
}

TEST(DictionaryForms, ComeBackUnderTheirKeys)
{
    CmHashDictionary dictionary;
    dictionary.takeElements();
    dictionary.add(new CmString("key"), new CmString("value"));
    dictionary.add(new CmUID(FUID(1, 2, 3, 4)), new CmString("other"));
    const CmString key("key");
    const CmUID uid(FUID(1, 2, 3, 4));

    CmHashDictionary fromAttributes;
    EXPECT_TRUE(throughAttributes(dictionary, fromAttributes));
    const IPtr<CmObject> fromArchive = throughArchive(dictionary);
    ASSERT_TRUE(fromArchive);
    for (const CmHashDictionary* restored :
         {&fromAttributes, static_cast<CmHashDictionary*>(fromArchive.get())})
    {
        EXPECT_EQ(restored->total(), 2);
        ASSERT_TRUE(restored->lookup(&key));
        EXPECT_STREQ(static_cast<CmString*>(restored->lookup(&key))->text8(), "value");
        EXPECT_TRUE(restored->contains(&uid));
    }
}

TEST(DictionaryForms, HalfAPairIsNone)
{
    const IPtr<CmString> text = adopt(new CmString("text"));
    for (const char* key : {"Key", "Obj"})
    {
        FAttributes attributes;
        attributes.setObject(key, text);
        const unsigned references = text->getRefCount();
        CmAssociation restored;
        EXPECT_FALSE(restored.restoreAttributes(attributes));
        EXPECT_TRUE(!restored.getKey() && !restored.getObject());
        EXPECT_EQ(text->getRefCount(), references);
    }
}

TEST(DictionaryForms, ARestoredPairGoesOverToItsDictionary)
{
    const IPtr<CmString> key = adopt(new CmString("key")), object = adopt(new CmString("object"));
    FAttributes attributes;
    CmAssociation(key, object).storeAttributes(attributes);
    const unsigned references = key->getRefCount();
    {
        CmHashDictionary dictionary;
        dictionary.takeElements();
        auto* restored = new CmAssociation;
        EXPECT_TRUE(restored->restoreAttributes(attributes));
        EXPECT_EQ(restored->getObject(), object.get());
        EXPECT_TRUE(dictionary.add(restored));
        EXPECT_EQ(key->getRefCount(), references + 1);
    }
    EXPECT_EQ(key->getRefCount(), references) << "released once, by the dictionary";
    EXPECT_EQ(object->getRefCount(), references);
}

TEST(DictionaryForms, ARestoredPairLivesAsLongAsItStandsInItsAssociation)
{
    const IPtr<CmString> key = adopt(new CmString("key")), object = adopt(new CmString("object"));
    const IPtr<CmString> other = adopt(new CmString("other"));
    FAttributes attributes;
    CmAssociation(key, object).storeAttributes(attributes);
    const unsigned references = key->getRefCount();
    const unsigned otherReferences = other->getRefCount();
    {
        CmAssociation restored;
        EXPECT_TRUE(restored.restoreAttributes(attributes));
        {
            CmAssociation copy(restored), assigned;
            assigned = copy;
            copy = static_cast<const CmAssociation&>(copy);
            EXPECT_EQ(key->getRefCount(), references + 3);
            EXPECT_EQ(object->getRefCount(), references + 3);
        }
        restored.setKey(key);
        restored.setObject(other);
        EXPECT_EQ(key->getRefCount(), references + 1);
        EXPECT_EQ(object->getRefCount(), references);
        restored.setKey(nullptr);
        EXPECT_EQ(key->getRefCount(), references);
    }
    {
        // Whoever makes the dictionary an owner afterwards leaves it what the pair held.
        CmHashDictionary dictionary;
        auto* restored = new CmAssociation;
        EXPECT_TRUE(restored->restoreAttributes(attributes));
        EXPECT_TRUE(dictionary.add(restored));
        dictionary.takeElements();
        other->addRef();
        EXPECT_TRUE(dictionary.replace(key, other));
        EXPECT_EQ(object->getRefCount(), references);
        EXPECT_TRUE(dictionary.remove(key));
    }
    EXPECT_EQ(key->getRefCount(), references);
    EXPECT_EQ(object->getRefCount(), references);
    EXPECT_EQ(other->getRefCount(), otherReferences);
}

TEST(CmUIDForms, AreItsDigits)
{
    const CmUID uid(FUID(0x00112233, 0x44556677, 0x8899AABB, 0xCCDDEEFF));
    FAttributes attributes;
    EXPECT_TRUE(uid.storeAttributes(attributes));
    EXPECT_STREQ(attributes.getString8("GUID"), "00112233445566778899AABBCCDDEEFF");
    CmUID restored;
    EXPECT_TRUE(restored.restoreAttributes(attributes));
    EXPECT_EQ(restored, uid);
    attributes.setString8("GUID", "0011");
    EXPECT_FALSE(restored.restoreAttributes(attributes));
    const IPtr<CmObject> read = throughArchive(uid);
    EXPECT_TRUE(uid.isEqual(read));
}

namespace
{
const FUID kComponentID(0xC0FFEE01, 2, 3, 4);

/// A component's object that stores one number.
class StoredComponent : public FObject, public IPersistent
{
    DECLARE_TYPE(StoredComponent, FObject)
    FORWARD_FUNKNOWN(FObject)

    int32 queryInterface(const char* interfaceID, void** object) override
    {
        if (isSameInterface(interfaceID, IPersistent::iid))
            return offerInterface<IPersistent>(this, object);
        return FObject::queryInterface(interfaceID, object);
    }
    int32 getClassID(char* uid) override
    {
        kComponentID.toTUID(uid);
        return kResultOk;
    }
    int32 saveAttributes(IAttributes* attributes) override
    {
        static_cast<FAttributes*>(attributes)->set("number", number);
        return canSave ? kResultOk : kNoInterface;
    }
    int32 loadAttributes(IAttributes* attributes) override
    {
        return static_cast<FAttributes*>(attributes)->get("number", number) ? kResultOk : kNoInterface;
    }

    static FUnknown* create() { return static_cast<FObject*>(new StoredComponent); }

    int number = 0;
    bool canSave = true;
};

class CountingModule : public FModule
{
public:
    void addInstance(FUnknown*) override { instances++; }
    void releaseInstance(FUnknown*) override { instances--; }

    int instances = 0;
};

class DelegatingUnknownForms : public testing::Test
{
protected:
    void SetUp() override
    {
        gComponentRegistry = &registry;
        registry.registerComponent(
            new FComponentDescription("Test", kComponentID, "Stored", StoredComponent::create, &module));
        component.number = 42;
    }
    void TearDown() override
    {
        gComponentRegistry = nullptr;
        EXPECT_EQ(module.instances, 0);
    }
    static int numberIn(const CmDelegatingUnknown& wrapper)
    {
        return static_cast<StoredComponent*>(toFObject(wrapper.getDelegate()))->number;
    }

    CountingModule module;
    FComponentRegistry registry;
    StoredComponent component;
};
} // namespace

TEST_F(DelegatingUnknownForms, MakeTheComponentAnew)
{
    const CmDelegatingUnknown wrapper(static_cast<FObject*>(&component), nullptr);
    CmDelegatingUnknown restored;
    EXPECT_TRUE(throughAttributes(wrapper, restored));
    EXPECT_EQ(numberIn(restored), 42);
    EXPECT_EQ(module.instances, 1) << "the module stays loaded with its object";

    const IPtr<CmObject> read = throughArchive(wrapper);
    ASSERT_TRUE(read);
    EXPECT_EQ(numberIn(static_cast<CmDelegatingUnknown&>(*read)), 42);
}

TEST_F(DelegatingUnknownForms, FailWithoutAWayToStoreOrMakeIt)
{
    FAttributes attributes;
    const CmDelegatingUnknown empty;
    EXPECT_FALSE(empty.storeAttributes(attributes));
    CmDelegatingUnknown wrapper(static_cast<FObject*>(&component), nullptr);
    component.canSave = false;
    EXPECT_FALSE(wrapper.storeAttributes(attributes));
    EXPECT_FALSE(attributes.containsAttribute("ObjData"));
    component.canSave = true;
    EXPECT_TRUE(wrapper.storeAttributes(attributes));
    registry.unregisterComponent(kComponentID);
    CmDelegatingUnknown restored;
    EXPECT_FALSE(restored.restoreAttributes(attributes));
    EXPECT_EQ(throughArchive(wrapper), nullptr);
}
