#include "containers/value/cmbuffer.h"
#include "foundation/object/cmdelegatingunknown.h"
#include "foundation/object/fvariant.h"
#include "foundation/text/cmstring.h"
#include "storage/attribute/fattributelistimp.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/fstringlist.h"
#include "tests/storage/objectfixture.h"

#include <gtest/gtest.h>

namespace
{
/// An object of a component, that is no CmObject.
class Stranger : public FUnknown
{
public:
    int32 queryInterface(const char* interfaceID, void** object) override
    {
        if (isSameInterface(interfaceID, FUnknown::iid))
            return offerInterface<FUnknown>(this, object);
        *object = nullptr;
        return kNoInterface;
    }
    uint32 addRef() override { return ++references; }
    uint32 release() override { return --references; }

    uint32 references = 1;
};
} // namespace

TEST(FAttributes, ReplacesAValueOfAnotherKindAndReleasesIt)
{
    const int before = StoredNode::alive;
    FAttributes tree;
    tree.setObject("a", new StoredNode, true);
    tree.set("a", 1);
    EXPECT_EQ(StoredNode::alive, before);
    tree.set("a", "text", false);
    EXPECT_EQ(tree.total(), 1);
    EXPECT_STREQ(tree.getString8("a"), "text");
    int number = 77;
    EXPECT_FALSE(tree.get("a", number));
    EXPECT_EQ(number, 77) << "untouched where the value is of another kind";
}

TEST(FAttributes, ReadsNumbersInEveryWidthAndConvertsThem)
{
    FAttributes tree;
    tree.set("i", -2);
    tree.set("u", 4000000000u);
    tree.set("b", true);
    tree.set("f", 2.75);
    tree.set("g", 0.5f);
    bool flag = false;
    unsigned int u = 0;
    short s = 0;
    char c = 0;
    unsigned char uc = 0;
    unsigned long ul = 0;
    long l = 0;
    float f = 0;
    double d = 0;
    EXPECT_TRUE(tree.get("b", flag) && tree.get("u", u) && tree.get("i", s) && tree.get("i", c) &&
                tree.get("b", uc));
    EXPECT_TRUE(tree.get("u", ul) && tree.get("f", l) && tree.get("f", f) && tree.get("i", d));
    EXPECT_TRUE(flag);
    EXPECT_EQ(u, 4000000000u);
    EXPECT_EQ(s, -2);
    EXPECT_EQ(c, -2);
    EXPECT_EQ(uc, 1);
    EXPECT_EQ(ul, 4000000000ul);
    EXPECT_EQ(l, 2) << "a float is cut";
    EXPECT_EQ(f, 2.75f);
    EXPECT_EQ(d, -2.0);
    EXPECT_EQ(tree.getFloat("g"), 0.5);
    EXPECT_EQ(tree.getInt("missing"), 0);
    EXPECT_EQ(tree.total(), 5) << "reading makes no entry";
}

TEST(FAttributes, KeepsTheWidthOfTexts)
{
    FAttributes tree;
    tree.set("8", "narrow");
    tree.set("16", u"weit ä");
    tree.set("s", FString(u"ö"));
    FString text;
    ASSERT_TRUE(tree.get("8", text));
    EXPECT_FALSE(text.isWideString());
    ASSERT_TRUE(tree.get("16", text));
    EXPECT_TRUE(text.isWideString());
    EXPECT_EQ(text, ConstString(u"weit ä"));
    EXPECT_EQ(ConstString(tree.getString16("s")), ConstString(u"ö"));
    EXPECT_FALSE(tree.get("missing", text));
    EXPECT_EQ(text, ConstString(u"weit ä"));
    EXPECT_EQ(tree.getString8("missing"), nullptr);
}

TEST(FAttributes, MembersRestoreFromTheirSubTree)
{
    FAttributes tree;
    EXPECT_TRUE(tree.setMember("m", StoredNode(5)));
    tree.set("n", 5);
    StoredNode restored;
    EXPECT_TRUE(tree.getMember("m", restored));
    EXPECT_EQ(restored.number, 5);
    EXPECT_FALSE(tree.getMember("n", restored)) << "a number is no member";
    EXPECT_FALSE(tree.getMember("x", restored));

    StoredNode refusing;
    refusing.refusesToStore = true;
    EXPECT_FALSE(tree.setMember("r", refusing));
    EXPECT_FALSE(tree.containsAttribute("r"));
}

TEST(FAttributes, BlocksComeFromThreeKindsOfObjects)
{
    FAttributes tree;
    char bytes[] = "abcdef";
    tree.setBinary("copied", bytes, 6);
    tree.setBinary("borrowed", bytes, 6, false);
    tree.setBinary("empty", bytes, 0);
    bytes[0] = 'X';
    tree.setObject("buffer", new CmBuffer("1234", 4), true);
    tree.setObject("stream", streamOf("xyz").take(), true);

    char result[8] = "-------";
    EXPECT_TRUE(tree.getBinary("copied", result, 3));
    EXPECT_STREQ(result, "abc----") << "no more than asked for";
    EXPECT_TRUE(tree.getBinaryData("borrowed", result, 8));
    EXPECT_STREQ(result, "Xbcdef-") << "no more than there is";
    EXPECT_TRUE(tree.getBinary("buffer", result, 2));
    EXPECT_TRUE(tree.getBinary("stream", result + 2, 3));
    EXPECT_STREQ(result, "12xyzf-");
    EXPECT_EQ(tree.getBinarySize("empty"), 0u);
    EXPECT_EQ(tree.getBinarySize("buffer"), 4u);
    EXPECT_EQ(tree.getBinarySize("missing"), 0u);
    EXPECT_TRUE(tree.getBinary("empty", nullptr, 0));
    tree.set("n", 1);
    EXPECT_FALSE(tree.getBinary("n", result, 2));
}

TEST(FAttributes, QueuesAreReadInOrderAndAreNotUsedUp)
{
    FAttributes tree;
    tree.queueInt("q", 1);
    tree.queueInt("q", 2);
    for (int round = 0; round < 2; round++)
    {
        long long value = 0;
        EXPECT_TRUE(tree.unqueueInt("q", value));
        EXPECT_EQ(value, 1);
        EXPECT_TRUE(tree.unqueueInt("q", value));
        EXPECT_EQ(value, 2);
        EXPECT_FALSE(tree.unqueueInt("q", value));
        EXPECT_EQ(value, 2);
        EXPECT_TRUE(tree.resetQueue("q"));
    }
    EXPECT_EQ(tree.countQueueItems("q"), 2);
    EXPECT_EQ(tree.countQueueItems("x"), 0);
    EXPECT_FALSE(tree.resetQueue("x"));

    tree.queueFloat("q", 0.5);
    EXPECT_EQ(tree.countQueueItems("q"), 1) << "a queue of another kind begins anew";
    double number = 0;
    EXPECT_TRUE(tree.unqueueFloat("q", number));
    EXPECT_EQ(number, 0.5);
    tree.queueString8("s", "narrow");
    tree.queueString16("s", u"weit", false);
    EXPECT_EQ(ConstString(tree.unqueueString("s")), ConstString(u"narrow"));
    FString text;
    EXPECT_TRUE(tree.unqueueString("s", text));
    EXPECT_EQ(text, ConstString(u"weit"));
    EXPECT_EQ(tree.unqueueString("s"), nullptr);
    tree.resetAllQueues();
    EXPECT_TRUE(tree.unqueueFloat("q", number) && tree.unqueueString("s", text));
}

TEST(FAttributes, QueuedObjectsComeWithAReference)
{
    const int before = StoredNode::alive;
    {
        FAttributes tree;
        auto first = adopt(new StoredNode(1));
        tree.queueObject("q", first);
        tree.queueObject("q", new CmString("other class"), true);
        tree.queueObject("q", new StoredNode(2), true);
        EXPECT_FALSE(tree.queueObject("q", nullptr));
        auto read = adopt(tree.unqueueObject("q", "StoredNode"));
        EXPECT_EQ(read.get(), static_cast<CmObject*>(first));
        EXPECT_EQ(first->getRefCount(), 3u);
        read = adopt(tree.unqueueObject("q", "StoredNode"));
        EXPECT_EQ(FCast(StoredNode, read.get())->number, 2) << "another class is passed over";
        EXPECT_EQ(tree.unqueueObject("q", "StoredNode"), nullptr);
    }
    EXPECT_EQ(StoredNode::alive, before);
}

TEST(FAttributes, QueuedMembersAreTrees)
{
    FAttributes tree;
    tree.queueMember("q", StoredNode(1));
    auto attributes = adopt(new FAttributes);
    attributes->set("Number", 2);
    tree.queueAttributes("q", attributes);
    EXPECT_EQ(tree.lookupQueueObjectAttributes("q")->getInt("Number"), 1) << "looked at, not read";
    StoredNode restored;
    EXPECT_TRUE(tree.unqueueMember("q", restored));
    EXPECT_EQ(restored.number, 1);
    EXPECT_EQ(tree.unqueueAttributes("q"), attributes.get());
    EXPECT_FALSE(tree.unqueueMember("q", restored));
    EXPECT_EQ(tree.lookupQueueObjectAttributes("q"), nullptr);
}

TEST(FAttributes, VariantsCarryEveryKind)
{
    Stranger stranger;
    {
        FAttributes tree;
        auto node = adopt(new StoredNode(4));
        FUnknown* nodeUnknown = node;
        const FVariant values[] = {FVariant(5),       FVariant(1.5),         FVariant("narrow"),
                                   FVariant(u"weit"), FVariant(nodeUnknown), FVariant(&stranger)};
        for (const FVariant& value : values)
        {
            EXPECT_TRUE(tree.set("v", value));
            EXPECT_TRUE(tree.queue("q", value));
            FVariant read, unqueued;
            EXPECT_TRUE(tree.get("v", read));
            EXPECT_TRUE(tree.unqueue("q", unqueued));
            EXPECT_EQ(read.getType(), value.getType());
            EXPECT_EQ(read.getInt(), value.getInt());
            EXPECT_EQ(read.getFloat(), value.getFloat());
            EXPECT_EQ(read.getObject(), value.getObject());
            EXPECT_EQ(unqueued.getObject(), value.getObject());
            tree.removeAttribute("q");
        }
        EXPECT_FALSE(tree.set("v", FVariant()));
        EXPECT_TRUE(FCast(CmDelegatingUnknown, tree.getObject("v", nullptr)));
    }
    EXPECT_EQ(stranger.references, 1u);
}

TEST(FAttributes, PathsLeadThroughSubTrees)
{
    FAttributes tree;
    auto sub = adopt(new FAttributes);
    auto deep = adopt(new FAttributes);
    tree.setAttributes("sub", sub);
    sub->setAttributes("deep", deep);
    deep->set("value", 7);
    tree.set("dotted.key", 8);
    FVariant value;
    EXPECT_TRUE(tree.extractValue("sub.deep.value", value));
    EXPECT_EQ(value.getInt(), 7);
    EXPECT_TRUE(tree.extractValue("dotted.key", value));
    EXPECT_EQ(value.getInt(), 8);
    EXPECT_EQ(tree.extractAttributes("sub.deep"), deep.get());
    EXPECT_FALSE(tree.extractValue("sub.missing", value));
    EXPECT_FALSE(tree.extractValue("sub.deep.value.more", value));
    EXPECT_EQ(tree.extractAttributes("sub.deep.value"), nullptr);
}

TEST(FAttributes, ListsOfComponentsTakeNumbersAndTextsByKeyAndTheRestTogether)
{
    FAttributes tree;
    tree.set("5", 1);
    tree.set("name", u"text");
    tree.setBinary("bytes", "ab", 2);

    FStringAttributeList list;
    tree.saveAttributes(list);
    EXPECT_EQ(list.total(), 3);
    EXPECT_TRUE(
        FCast(FAttributes, list.getObjAttribute("Additional Attributes"))->containsAttribute("bytes"));
    FAttributes back;
    back.loadAttributes(list);
    EXPECT_EQ(back.total(), 3);
    EXPECT_EQ(back.getBinarySize("bytes"), 2u);

    FIntAttributeList numbered;
    tree.saveAttributes(numbered);
    EXPECT_EQ(numbered.getAttribute(5)->getLong(), 1);
    EXPECT_EQ(numbered.total(), 2) << "a key that is no number goes with the rest";
    FAttributes numberedBack;
    numberedBack.loadAttributes(numbered);
    EXPECT_EQ(numberedBack.total(), 3);
    EXPECT_EQ(numberedBack.getInt("5"), 1);
}

TEST(FAttributes, TheAdapterShowsListsToComponents)
{
    auto list = adopt(new FStringAttributeList);
    auto adapter = adopt(new FAttributeListImp<FStringAttributeList>(list));
    auto view = adopt(askInterface<IAttributeList>(static_cast<FObject*>(adapter.get())));
    ASSERT_TRUE(view);
    EXPECT_EQ(view->setIntAttribute("i", 3), kResultOk);
    EXPECT_EQ(view->setStringAttribute("s", u"text"), kResultOk);
    EXPECT_EQ(view->setBinaryAttribute("b", "xyz", 3), kResultOk);
    const char16* text = nullptr;
    const void* block = nullptr;
    uint32 size = 0;
    int64 number = 0;
    EXPECT_EQ(view->getStringAttribute("s", &text), kResultOk);
    EXPECT_EQ(ConstString(text), ConstString(u"text"));
    EXPECT_EQ(view->getBinaryAttribute("b", &block, &size), kResultOk);
    EXPECT_EQ(size, 3u);
    EXPECT_NE(view->getIntAttribute("s", &number), kResultOk);

    auto numbered = adopt(new FIntAttributeList);
    auto numberedAdapter = adopt(new FAttributeListImp<FIntAttributeList>(numbered));
    EXPECT_NE(numberedAdapter->setIntAttribute("word", 1), kResultOk) << "no such key in this list";
    EXPECT_EQ(numberedAdapter->setIntAttribute("12", 1), kResultOk);
    EXPECT_EQ(numberedAdapter->addAllTo(adapter.get()), kResultOk);
    EXPECT_EQ(view->getIntAttribute("12", &number), kResultOk);
    EXPECT_EQ(list->total(), 4);
}

TEST(FAttributes, IsFoundUnderItsOlderNameAndAsAnInterface)
{
    FAttributes tree;
    EXPECT_STREQ(FAttributes::__fClass.persistentName, "Attributes");
    auto view = adopt(askInterface<IAttributes>(static_cast<CmObject*>(&tree)));
    ASSERT_TRUE(view);
    EXPECT_TRUE(view->set("a", FVariant(3)));
    EXPECT_EQ(tree.getInt("a"), 3);
}

TEST(FStringList, MakesBorrowedTextsItsOwn)
{
    char16 text[] = u"before";
    FStringList list;
    list.queue(text, true, false);
    const FStringList copy(list);
    list.makeOwner();
    text[0] = u'X';
    EXPECT_EQ(ConstString(list.unqueue()), ConstString(u"before"));
    EXPECT_EQ(ConstString(copy.at(0)), ConstString(u"before"));
}
