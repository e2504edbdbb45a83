#include "containers/sequence/cmlinkedlist.h"
#include "foundation/text/cmstring.h"
#include "storage/attribute/fattributelist.h"
#include "storage/attribute/fsimplearchive.h"
#include "tests/storage/objectfixture.h"

#include <gtest/gtest.h>

namespace
{
std::string le32(int32 value)
{
    return std::string(reinterpret_cast<const char*>(&value), 4);
}

std::string str8(const std::string& text)
{
    return le32(static_cast<int32>(text.size()) + 1) + text + '\0';
}

constexpr int32 classNumber(int32 number)
{
    return static_cast<int32>(0x80000000u | static_cast<uint32>(number));
}

const std::string kNodeRecord = le32(-1) + str8("StoredNode") + std::string("\3\0", 2);

template <class Write>
std::string written(Write write)
{
    auto stream = adopt(new FMemoryStream);
    FSimpleArchive archive(stream, true);
    write(archive);
    return contentOf(*stream);
}

IPtr<CmObject> readOne(const std::string& bytes, const char* className = "CmObject")
{
    FSimpleArchive archive(streamOf(bytes), false);
    auto object = adopt(archive.readObject(className, true));
    EXPECT_EQ(object == nullptr, archive.getLastError() == FArchive::kBadObject);
    return object;
}
} // namespace

TEST(FSimpleArchive, NumbersClassesAndObjectsInOneRow)
{
    EXPECT_EQ(hex(written([](FArchive& archive) { archive.writeObject(nullptr, true); })), hex(le32(0)));

    auto first = adopt(new StoredNode(7));
    auto second = adopt(new StoredNode(8));
    auto text = adopt(new CmString("x"));
    const auto write = [&](FArchive& archive)
    {
        archive.writeObject(first, true);
        archive.writeObject(second, true);
        archive.writeObject(text, true);
        archive.writeObject(second, true);
        archive.writeObject(second, false);
    };
    // The class is 1, the nodes 2 and 3, the class of texts 4.
    const std::string expected = kNodeRecord + le32(7) + le32(0) + le32(classNumber(1)) + le32(8) + le32(0) +
                                 le32(-1) + str8("CmString") + std::string(2, '\0') + str8("x") + le32(3) +
                                 le32(classNumber(1)) + le32(8) + le32(0);
    EXPECT_EQ(hex(written(write)), hex(expected));

    FSimpleArchive archive(streamOf(expected), false);
    const auto a = adopt(archive.readObject("StoredNode", true));
    const auto b = adopt(archive.readObject("StoredNode", true));
    const auto c = adopt(archive.readObject("CmString", true));
    const auto again = adopt(archive.readObject("StoredNode", true));
    const auto separate = adopt(archive.readObject("StoredNode", false));
    ASSERT_TRUE(a && b && c && again && separate);
    EXPECT_EQ(FCast(StoredNode, a.get())->number, 7);
    EXPECT_STREQ(FCast(CmString, c.get())->text8(), "x");
    EXPECT_EQ(again, b);
    EXPECT_NE(separate, b);
    EXPECT_EQ(archive.getVersion("StoredNode"), 3);
    EXPECT_EQ(archive.getObjects().size(), 4u);
    EXPECT_EQ(archive.getLastError(), 0);
}

TEST(FSimpleArchive, RefusesWhatHoldsItself)
{
    auto node = adopt(new StoredNode(1));
    auto other = adopt(new StoredNode(2, node));
    node->next = other;
    written(
        [&](FArchive& archive)
        {
            EXPECT_FALSE(archive.writeObject(node, true));
            EXPECT_EQ(archive.getLastError(), FArchive::kBadObject);
        });
    node->next = nullptr;
    EXPECT_FALSE(readOne(kNodeRecord + le32(1) + le32(2))) << "the node's own number";
}

TEST(FSimpleArchive, ReadsNothingFromDamagedBytes)
{
    const std::string node = kNodeRecord + le32(7) + le32(0);
    ASSERT_TRUE(readOne(node));
    for (size_t length = 0; length < node.size(); length++)
        EXPECT_FALSE(readOne(node.substr(0, length))) << length;
    EXPECT_FALSE(readOne(node, "CmString")) << "of another class";
    EXPECT_FALSE(readOne(le32(1))) << "no object has this number yet";
    EXPECT_FALSE(readOne(le32(classNumber(1)) + le32(7) + le32(0))) << "no class has this number yet";
    EXPECT_FALSE(readOne(le32(classNumber(0)) + le32(7) + le32(0)));
    EXPECT_FALSE(readOne(le32(-1) + str8("NoSuchClass") + std::string(2, '\0') + le32(7) + le32(0)));
    EXPECT_FALSE(readOne(kNodeRecord + le32(7) + le32(1))) << "number 1 is a class";
    EXPECT_FALSE(readOne(kNodeRecord + le32(7) + le32(classNumber(2)) + le32(1))) << "number 2 is an object";
    EXPECT_EQ(StoredNode::alive, 0);
}

TEST(FSimpleArchive, LimitsTheDepth)
{
    std::string bytes = kNodeRecord + le32(0);
    for (int i = 0; i < 100000; i++)
        bytes += le32(classNumber(1)) + le32(i);
    EXPECT_FALSE(readOne(bytes));

    IPtr<CmObject> chain;
    for (int i = 0; i < FArchive::kMaxDepth + 1; i++)
        chain = adopt(new StoredNode(i, chain));
    written([&](FArchive& archive) { EXPECT_FALSE(archive.writeObject(chain, true)); });
    const auto fits = IPtr<CmObject>(FCast(StoredNode, chain.get())->next);
    const std::string whole =
        written([&](FArchive& archive) { EXPECT_TRUE(archive.writeObject(fits, true)); });
    EXPECT_TRUE(readOne(whole));
}

TEST(FAttributeList, KeepsTheLastOfEntriesThatAreReadUnderOneKey)
{
    const auto entry = [](const std::string& key, char value)
    { return str8(key) + std::string("\1\0", 2) + value + std::string(7, '\0'); };
    const std::string bytes =
        le32(5) + entry("c", 1) + entry("a", 2) + entry("c", 3) + entry("b", 4) + entry("a", 5);
    FStringAttributeList sorted;
    FStringAttributeArray unsorted;
    FSimpleArchive first(streamOf(bytes), false), second(streamOf(bytes), false);
    ASSERT_TRUE(sorted.internalize(first) && unsorted.internalize(second));
    const auto show = [](const auto& list)
    {
        std::string result;
        for (int i = 0; i < list.total(); i++)
            result += list.entryAt(i)->getKey() + std::to_string(list.entryAt(i)->getLong()) + ' ';
        return result;
    };
    EXPECT_EQ(show(sorted), "a5 b4 c3 ");
    EXPECT_EQ(show(unsorted), "c3 b4 a5 ");
    FSimpleArchive cut(streamOf(bytes.substr(0, bytes.size() - 1)), false);
    EXPECT_FALSE(sorted.internalize(cut));
    EXPECT_EQ(show(sorted), "a2 b4 c3 ") << "what was whole stays";
}
