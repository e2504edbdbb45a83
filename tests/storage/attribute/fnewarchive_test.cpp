#include "foundation/text/cmstring.h"
#include "storage/attribute/fnewarchive.h"
#include "storage/attribute/fobjectlist.h"
#include "tests/storage/objectfixture.h"
#include "tests/storage/wordcomponent.h"

#include <gtest/gtest.h>

namespace
{
class Derived : public StoredNode
{
    DECLARE_CLASS(Derived, StoredNode)
};
DEFINE_CLASS_VERSION(Derived, StoredNode, 5)

class CountingHook : public IArchiveErrorHook
{
public:
    int32 queryInterface(const char*, void**) override { return kNoInterface; }
    uint32 addRef() override { return 1; }
    uint32 release() override { return 1; }
    void onArchiveError(FArchive&, int32 error) override { heard.push_back(error); }

    std::vector<int32> heard;
};

class DoubtfulStream : public FMemoryStream
{
    DECLARE_COPYABLE(DoubtfulStream, FMemoryStream)

    bool verify() override { return isSound; }
    bool isSound = true;
};

std::string le32(int32 value)
{
    return std::string(reinterpret_cast<const char*>(&value), 4);
}

std::string str8(const std::string& text)
{
    return le32(static_cast<int32>(text.size()) + 1) + text + '\0';
}

template <class Write>
std::string written(Write write)
{
    auto stream = adopt(new FMemoryStream);
    FNewArchive archive(stream, true);
    write(archive);
    EXPECT_EQ(archive.getLastError(), 0);
    return contentOf(*stream);
}

const std::string kNodeRecord = le32(-2) + str8("CmObject") + std::string(2, '\0') + le32(-1) +
                                str8("StoredNode") + std::string("\3\0", 2);
} // namespace

TEST(FNewArchive, WritesRecordsBodiesAndReferences)
{
    const auto isNull = [](FArchive& archive) { archive.writeObject(nullptr, true); };
    EXPECT_EQ(hex(written(isNull)), hex(le32(0)));

    auto node = adopt(new StoredNode(7));
    const auto twice = [&](FArchive& archive)
    {
        archive.writeObject(node, true);
        archive.writeObject(node, true);
    };
    const int32 position = static_cast<int32>(kNodeRecord.size());
    EXPECT_EQ(hex(written(twice)), hex(kNodeRecord + le32(8) + le32(7) + le32(0) + le32(position)));

    const auto separate = [&](FArchive& archive)
    {
        archive.writeObject(node, false);
        archive.writeObject(node, false);
    };
    const int32 classReference = static_cast<int32>(0x80000000 | (kNodeRecord.size() - 21));
    const std::string body = le32(8) + le32(7) + le32(0);
    EXPECT_EQ(hex(written(separate)), hex(kNodeRecord + body + le32(classReference) + body));
}

TEST(FNewArchive, NamesBaseClassesNearestFirstAndOnlyOnce)
{
    Derived derived;
    StoredNode node;
    const std::string bytes = written(
        [&](FArchive& archive)
        {
            archive.writeObject(&derived, true);
            archive.writeObject(&node, true);
        });
    const std::string records = le32(-2) + str8("StoredNode") + std::string("\3\0", 2) + le32(-2) +
                                str8("CmObject") + std::string(2, '\0') + le32(-1) + str8("Derived") +
                                std::string("\5\0", 2);
    EXPECT_EQ(hex(bytes.substr(0, records.size())), hex(records));
    const std::string second = bytes.substr(records.size() + 12, 4);
    EXPECT_EQ(hex(second), hex(le32(static_cast<int32>(0x80000000))))
        << "the record of the base class at position 0";
}

TEST(FNewArchive, ReadsSharedObjectsAndCirclesBack)
{
    const int before = StoredNode::alive;
    {
        auto first = adopt(new StoredNode(1));
        first->next = new StoredNode(2, first);
        first->next->release();
        const std::string bytes = written([&](FArchive& archive) { archive.save(first); });
        first->nextNode()->next = nullptr;

        FNewArchive archive(streamOf(bytes), false);
        auto read = adopt(FCast(StoredNode, archive.load("StoredNode")));
        ASSERT_TRUE(read && read->nextNode());
        EXPECT_EQ(read->number, 1);
        EXPECT_EQ(read->nextNode()->number, 2);
        EXPECT_EQ(read->nextNode()->nextNode(), read.get());
        EXPECT_EQ(archive.getVersion("StoredNode"), 3);
        read->nextNode()->next = nullptr;
    }
    EXPECT_EQ(StoredNode::alive, before);
}

TEST(FNewArchive, ReadsAsAKnownBaseClassAndPassesOverTheRest)
{
    Derived derived;
    derived.number = 9;
    std::string bytes = written(
        [&](FArchive& archive)
        {
            archive.writeObject(&derived, true);
            archive.writeObject(adopt(new CmString("behind")), true);
        });
    bytes.replace(bytes.find("Derived"), 7, "Unknown");
    FNewArchive archive(streamOf(bytes), false);
    auto read = adopt(FCast(StoredNode, archive.readObject("StoredNode", true)));
    ASSERT_TRUE(read);
    EXPECT_EQ(read->number, 9);
    EXPECT_STREQ(read->isA(), "StoredNode");
    auto text = adopt(FCast(CmString, archive.readObject("CmString", true)));
    ASSERT_TRUE(text);
    EXPECT_EQ(*text, ConstString("behind"));
}

TEST(FNewArchive, AWrongClassIsAnErrorAndDoesNotStopTheReading)
{
    StoredNode node(1);
    const std::string bytes = written(
        [&](FArchive& archive)
        {
            archive.writeObject(&node, true);
            archive.writeObject(&node, true);
            archive.writeObject(adopt(new CmString("behind")), true);
        });
    CountingHook hook;
    FNewArchive archive(streamOf(bytes), false, &hook);
    EXPECT_EQ(archive.readObject("CmString", true), nullptr);
    EXPECT_EQ(archive.readObject("StoredNode", true), nullptr)
        << "the object was passed over, so nothing is there";
    EXPECT_EQ(archive.getLastError(), -99);
    EXPECT_EQ(archive.getErrors(), std::vector<int32>{-99}) << "each error once";
    EXPECT_EQ(hook.heard, (std::vector<int32>{-99, -99})) << "the hook hears of all";
    EXPECT_TRUE(adopt(archive.readObject("CmString", true)));
}

TEST(FNewArchive, AStreamThatLostDataIsTheLastWord)
{
    auto stream = adopt(new DoubtfulStream);
    FNewArchive archive(stream, true);
    archive.setError(-97);
    EXPECT_EQ(archive.getLastError(), -97);
    archive.setError(-99);
    EXPECT_EQ(archive.getLastError(), -99);
    stream->isSound = false;
    EXPECT_EQ(archive.getLastError(), -100);
    archive.setError(-97);
    EXPECT_EQ(archive.getLastError(), -100);
    EXPECT_EQ(archive.getErrors(), (std::vector<int32>{-97, -99, -100}));
}

TEST(FNewArchive, TreesKeepEveryKindOfValue)
{
    FAttributes tree;
    auto node = adopt(new StoredNode(5));
    tree.set("i", 1);
    tree.set("f", 0.25);
    tree.set("s", "narrow");
    tree.set("w", u"weit ä");
    tree.setObject("n", node);
    tree.setBinary("b", "xyz", 3);
    auto sub = adopt(new FAttributes);
    sub->setObject("same", node);
    tree.setAttributes("sub", sub);
    tree.queueInt("qi", -1);
    tree.queueFloat("qf", 2.5);
    tree.queueString16("qs", u"ö");
    tree.queueObject("qo", node);
    tree.queueAttributes("qa", sub);
    const std::string bytes = written([&](FArchive& archive) { EXPECT_TRUE(tree.externalize(archive)); });

    FAttributes read;
    FNewArchive archive(streamOf(bytes), false);
    ASSERT_TRUE(read.internalize(archive));
    EXPECT_EQ(read.total(), tree.total());
    EXPECT_EQ(read.getInt("i"), 1);
    EXPECT_EQ(read.getFloat("f"), 0.25);
    EXPECT_STREQ(read.getString8("s"), "narrow");
    EXPECT_EQ(ConstString(read.getString16("w")), ConstString(u"weit ä"));
    EXPECT_EQ(read.getBinarySize("b"), 3u);
    CmObject* object = read.getObject("n", "StoredNode");
    ASSERT_TRUE(object);
    EXPECT_EQ(read.getAttributes("sub")->getObject("same", nullptr), object);
    EXPECT_EQ(adopt(read.unqueueObject("qo", nullptr)).get(), object);
    EXPECT_EQ(ConstString(read.unqueueString("qs")), ConstString(u"ö"));
    EXPECT_EQ(read.unqueueAttributes("qa")->getObject("same", nullptr), object);
}

TEST(FNewArchive, ObjectsOfComponentsKeepTheirOwnTexts)
{
    const WordComponents components;
    FAttributes tree;
    for (const char* key : {"a", "b", "c"})
    {
        auto component = adopt(new WordComponent);
        component->word.assign(key);
        tree.entry(key).setUnknown(static_cast<FObject*>(component), FAttributeValue::kBorrowed);
    }
    const std::string bytes = written([&](FArchive& archive) { EXPECT_TRUE(tree.externalize(archive)); });

    FAttributes read;
    FNewArchive archive(streamOf(bytes), false);
    EXPECT_TRUE(read.internalize(archive));
    for (const char* key : {"a", "b", "c"})
    {
        auto* component = static_cast<WordComponent*>(toFObject(read.entry(key).getUnknown()));
        ASSERT_TRUE(component) << key;
        EXPECT_STREQ(component->word.text8(), key) << "not that of a component whose memory was used again";
    }
}

TEST(FNewArchive, RefusesBorrowedTextsAndUnknownKinds)
{
    FAttributes tree;
    tree.set("s", "borrowed", false);
    auto stream = adopt(new FMemoryStream);
    FNewArchive archive(stream, true);
    EXPECT_FALSE(tree.externalize(archive));

    FAttributes read;
    FNewArchive reader(streamOf(le32(1) + str8("k") + std::string("\0\20", 2)), false);
    EXPECT_FALSE(read.internalize(reader));
    EXPECT_EQ(reader.getLastError(), -97);
}

TEST(FNewArchive, NestsOnlySoDeep)
{
    const auto chainOf = [](int length)
    {
        IPtr<StoredNode> last;
        for (int i = 0; i < length; i++)
            last = adopt(new StoredNode(i, last));
        return last;
    };
    auto stream = adopt(new FMemoryStream);
    FNewArchive archive(stream, true);
    const IPtr<StoredNode> deepest = chainOf(FArchive::kMaxDepth);
    EXPECT_TRUE(archive.writeObject(deepest, true));
    EXPECT_FALSE(archive.writeObject(chainOf(FArchive::kMaxDepth + 1), true));
    EXPECT_EQ(archive.getLastError(), -99);
    stream->rewind();
    FNewArchive reader(stream, false);
    EXPECT_TRUE(adopt(reader.readObject("StoredNode", true)));
}

TEST(FNewArchive, DamagedBytesFailOrReadAndNeverMore)
{
    const int before = StoredNode::alive;
    FAttributes tree;
    tree.set("s", "narrow");
    tree.setObject("n", adopt(new StoredNode(5, adopt(new StoredNode(6)))));
    tree.setBinary("b", "xyz", 3);
    tree.queueObject("q", tree.getObject("n", nullptr));
    tree.queueMember("m", StoredNode(1));
    const std::string whole = written([&](FArchive& archive) { tree.externalize(archive); });
    for (size_t i = 0; i < whole.size(); i++)
    {
        FAttributes cut;
        FNewArchive cutArchive(streamOf(whole.substr(0, i)), false);
        EXPECT_FALSE(cut.internalize(cutArchive)) << "cut at " << i;
        for (const char value : {'\0', '\1', '\x7F', '\x80', '\xFF'})
        {
            std::string bytes = whole;
            bytes[i] = value;
            FAttributes damaged;
            FNewArchive archive(streamOf(bytes), false);
            damaged.internalize(archive);
        }
    }
    tree.removeAll();
    EXPECT_EQ(StoredNode::alive, before);
}

TEST(FNewArchive, AFullDiskFailsTheWriting)
{
    const StoredNode node(5, adopt(new StoredNode(6)));
    const auto size =
        static_cast<int64>(written([&](FArchive& archive) { archive.writeObject(&node, true); }).size());
    for (int64 room = 0; room < size; room++)
    {
        auto stream = adopt(new FullStream(room));
        FNewArchive archive(stream, true);
        EXPECT_FALSE(archive.writeObject(&node, true)) << room;
    }
}

TEST(FArchive, CallsPreSaveFunctionsInTheirOrderAndReleasesWhatItForgetsLater)
{
    static std::string calls;
    FArchive::registerPreSaveFunction([] { calls += 'a'; });
    FArchive::registerPreSaveFunction([] { calls += 'b'; });
    auto node = adopt(new StoredNode);
    {
        FNewArchive archive(adopt(new FMemoryStream), true);
        node->addRef();
        archive.forgetLater(node);
        EXPECT_TRUE(archive.save(node));
        EXPECT_EQ(node->getRefCount(), 2u);
    }
    EXPECT_EQ(node->getRefCount(), 1u);
    EXPECT_EQ(calls, "ab");
}
