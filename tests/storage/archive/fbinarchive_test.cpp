#include "storage/archive/fbinarchive.h"
#include "storage/attribute/fnewarchive.h"
#include "tests/storage/archive/archivesamples.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>

namespace
{
template <class T>
std::string le(T value)
{
    return std::string(reinterpret_cast<const char*>(&value), sizeof(T));
}

std::string stored(const std::string& text)
{
    return le<int32>(static_cast<int32>(text.size()) + 1) + text + '\0';
}

std::string entry(const std::string& key, uint16 type)
{
    return stored(key) + le<uint16>(type);
}

/// An object entry with its sub-kind.
std::string object(const std::string& key, uint16 kind)
{
    return entry(key, 2) + le(kind);
}

std::string idOf(const CmObject* object)
{
    return le<uint64>(reinterpret_cast<uintptr_t>(object));
}

std::string save(const FAttributes& tree)
{
    auto stream = adopt(new FMemoryStream);
    EXPECT_TRUE(FBinArchive(stream, true).saveAttributes(tree));
    return contentOf(*stream);
}

bool load(const std::string& bytes, FAttributes& tree)
{
    return FBinArchive(streamOf(bytes), false).loadAttributes(tree);
}

/// A stream that can't be sought and hands out a few bytes at a time.
class Pipe : public FMemoryStream
{
    DECLARE_COPYABLE(Pipe, FMemoryStream)

    int64 readRaw(void* target, int64 count) override
    {
        return FMemoryStream::readRaw(target, std::min<int64>(count, 3));
    }
    int64 seek(int64, FSeekMode) override { return -1; }
    int64 tell() override { return -1; }
};
} // namespace

TEST(FBinArchive, WritesEachKindOfValue)
{
    FAttributes tree;
    tree.set("f", 0.5);
    tree.set("i", -2);
    tree.set("s", "ab");
    tree.set("v", "");
    tree.set("w", u"ä");
    EXPECT_EQ(hex(save(tree)), hex(le<int32>(5) + entry("f", 4) + le(0.5) + entry("i", 1) + le<int64>(-2) +
                                   entry("s", 8) + stored("ab") + entry("v", 8) + le<int32>(0) +
                                   entry("w", 520) + le<int32>(6) + "\xC3\xA4" + '\0' + "\xEF\xBB\xBF"));
}

TEST(FBinArchive, WritesEachKindOfObject)
{
    auto node = adopt(new StoredNode(1));
    auto sub = adopt(new FAttributes);
    sub->set("n", 1);
    FAttributes tree;
    tree.setAttributes("a", sub);
    tree.setBinary("b", "xyz", 3);
    tree.queueInt("c", 9);
    tree.queueFloat("d", 0.5);
    tree.queueString16("e", u"z");
    tree.queueAttributes("f", sub);
    tree.setObject("g", node);
    tree.setObject("h", node);
    tree.queueObject("i", node);
    tree.entry("j").setUnknown(static_cast<FUnknown*>(node.get()), FAttributeValue::kBorrowed);
    const std::string one = le<int32>(1);
    const std::string subBytes = one + entry("n", 1) + le<int64>(1);
    const std::string nodeBytes = stored("StoredNode") + idOf(node) + one + entry("Number", 1) + le<int64>(1);
    EXPECT_EQ(hex(save(tree)),
              hex(le<int32>(10) + object("a", 6) + subBytes + object("b", 7) + le<int32>(3) + "xyz" +
                  object("c", 2) + one + le<int64>(9) + object("d", 3) + one + le(0.5) + object("e", 4) +
                  one + le<int32>(5) + "z" + '\0' + "\xEF\xBB\xBF" + object("f", 5) + one + subBytes +
                  object("g", 20) + nodeBytes + object("h", 21) + idOf(node) + object("i", 201) + one +
                  le<uint16>(21) + idOf(node) + entry("j", 258) + le<uint16>(21) + idOf(node)));
    FAttributes read;
    ASSERT_TRUE(load(save(tree), read));
    EXPECT_TRUE(read.getObject("j", "StoredNode"));
    EXPECT_EQ(read.getObject("j", "StoredNode"), read.getObject("g", nullptr));
}

TEST(FBinArchive, WritesAndReadsRoots)
{
    auto shared = adopt(new StoredNode(2));
    auto local = adopt(new StoredNode(1, shared));
    auto stream = adopt(new FMemoryStream);
    FBinArchive archive(stream, true);
    archive.addGlobalRoot("one", shared);
    archive.addGlobalRoot("two", shared);
    archive.addRoot("local", local);
    ASSERT_TRUE(archive.save());
    const std::string nodeBytes =
        stored("StoredNode") + idOf(shared) + le<int32>(1) + entry("Number", 1) + le<int64>(2);
    EXPECT_EQ(hex(contentOf(*stream)),
              hex(le<int32>(2) + stored("one") + idOf(shared) + nodeBytes + stored("two") + idOf(shared) +
                  le<int32>(1) + stored("local") + le<int32>(2) + object("Next", 21) + idOf(shared) +
                  entry("Number", 1) + le<int64>(1)));
    stream->rewind();
    FBinArchive reader(stream, false);
    ASSERT_TRUE(reader.load());
    auto* root = FCast(StoredNode, reader.getRoot("local", "StoredNode"));
    ASSERT_TRUE(root);
    EXPECT_EQ(reader.getGlobalRoot("one", "StoredNode"), root->next.get());
    EXPECT_EQ(reader.getGlobalRoot("two", "StoredNode"), root->next.get());
}

TEST(FBinArchive, EveryKindComesBackAndIsSavedAgainAsItWas)
{
    const int before = StoredNode::alive;
    {
        FAttributes read, again, made;
        ASSERT_TRUE(load(save(*makeSampleTree()), read));
        ASSERT_TRUE(load(save(read), again));
        EXPECT_EQ(describeSample(read), kWholeSample);
        EXPECT_EQ(describeSample(again), kWholeSample);
        ASSERT_TRUE(load(save(read), made));
        EXPECT_EQ(describeSample(made), kWholeSample);
    }
    EXPECT_EQ(StoredNode::alive, before);
}

TEST(FBinArchive, StopsRightBehindItsBytesAndTakesAnyStream)
{
    const std::string bytes = save(*makeSampleTree());
    auto stream = streamOf(bytes + "behind");
    FAttributes tree;
    ASSERT_TRUE(FBinArchive(stream, false).loadAttributes(tree));
    EXPECT_EQ(stream->tell(), static_cast<int64>(bytes.size()));

    auto pipe = adopt(new Pipe);
    pipe->writeRaw(bytes.data(), static_cast<int64>(bytes.size()));
    pipe->FMemoryStream::seek(0, kSeekStart);
    FAttributes piped;
    ASSERT_TRUE(FBinArchive(pipe, false).loadAttributes(piped));
    EXPECT_EQ(describeSample(piped), kWholeSample);
}

TEST(FBinArchive, FollowsTheByteOrderOfTheStream)
{
    FAttributes tree;
    tree.set("i", 0x0102);
    auto stream = adopt(new FMemoryStream);
    stream->setByteOrder(1);
    ASSERT_TRUE(FBinArchive(stream, true).saveAttributes(tree));
    EXPECT_EQ(hex(contentOf(*stream)), hex(std::string("\0\0\0\1\0\0\0\2i\0\0\1\0\0\0\0\0\0\1\2", 20)));
    stream->rewind();
    FAttributes read;
    EXPECT_TRUE(FBinArchive(stream, false).loadAttributes(read));
    EXPECT_EQ(read.getInt("i"), 0x0102);
}

TEST(FBinArchive, TakesTextsInTheOlderOrderAndRefusesLongOnes)
{
    FAttributes tree;
    const std::string older = le<int32>(6) + "\xEF\xBB\xBF\xC3\xA4" + '\0';
    ASSERT_TRUE(load(le<int32>(1) + entry("w", 520) + older, tree));
    EXPECT_EQ(ConstString(tree.getString16("w")), ConstString(u"ä"));
    const auto textOf = [](int32 count)
    { return le<int32>(1) + entry("s", 8) + le(count) + std::string(static_cast<size_t>(count), 'a'); };
    EXPECT_TRUE(load(textOf(50000), tree));
    EXPECT_EQ(strlen(tree.getString8("s")), 50000u) << "without a terminator all counts";
    EXPECT_FALSE(load(textOf(50001), tree));

    FAttributes read;
    tree.set("s", std::string(49999, 'a').c_str());
    EXPECT_TRUE(load(save(tree), read));
    tree.set("s", std::string(50000, 'a').c_str());
    EXPECT_FALSE(FBinArchive(adopt(new FMemoryStream), true).saveAttributes(tree))
        << "could not be read again";
}

TEST(FBinArchive, TellsItsOwnerOfErrors)
{
    FNewArchive owner(adopt(new FMemoryStream), false);
    FAttributes tree;
    EXPECT_FALSE(FBinArchive(streamOf("x"), false, &owner).loadAttributes(tree));
    EXPECT_EQ(owner.getLastError(), -99);
}

TEST(FBinArchive, SizesThatTheStreamDoesNotHoldCostNothing)
{
    const int32 huge = 0x7FFFFFFF;
    const std::string one = le<int32>(1);
    for (const std::string& bytes :
         {le(huge), le<int32>(-1), one + object("b", 7) + le(huge), one + object("b", 7) + le<int32>(-1),
          one + object("b", 2) + le(huge), one + object("b", 5) + le(huge), one + object("b", 201) + le(huge),
          one + object("b", 20) + le(huge), one + object("b", 99), one + entry("b", 3)})
    {
        FAttributes tree;
        EXPECT_FALSE(load(bytes, tree)) << hex(bytes);
    }
}

TEST(FBinArchive, NestsOnlySoDeep)
{
    IPtr<StoredNode> chain;
    for (int i = 0; i < FArchive::kMaxDepth - 1; i++)
        chain = adopt(new StoredNode(i, chain));
    FAttributes tree, read;
    tree.setObject("a", chain);
    EXPECT_TRUE(load(save(tree), read));
    tree.setObject("a", adopt(new StoredNode(0, chain)));
    EXPECT_FALSE(FBinArchive(adopt(new FMemoryStream), true).saveAttributes(tree));

    std::string bytes;
    for (int i = 0; i < 100000; i++)
        bytes += le<int32>(1) + object("m", 6);
    EXPECT_FALSE(load(bytes, read));
}

TEST(FBinArchive, AFullDiskFailsTheSaving)
{
    const auto tree = makeSampleTree();
    const auto size = static_cast<int64>(save(*tree).size());
    for (int64 room = 0; room < size; room++)
        EXPECT_FALSE(FBinArchive(adopt(new FullStream(room)), true).saveAttributes(*tree)) << room;
}

TEST(FBinArchive, DamagedBytesFailOrReadAndNeverMore)
{
    const std::string whole = save(*makeSampleTree());
    for (size_t i = 0; i < whole.size(); i++)
    {
        FAttributes cut;
        EXPECT_FALSE(load(whole.substr(0, i), cut)) << "cut at " << i;
        for (const char value : {'\0', '\1', '\x14', '\x7F', '\x80', '\xFF'})
        {
            std::string bytes = whole;
            bytes[i] = value;
            FAttributes damaged;
            if (load(bytes, damaged))
                describeSample(damaged);
        }
    }
}
