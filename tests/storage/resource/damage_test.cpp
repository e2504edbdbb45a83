#include "resourcefixture.h"
#include "storage/filesystem/ffileiterator.h"
#include "storage/resource/archivename.h"
#include "storage/resource/resourcecheck.h"
#include "storage/stream/fmemorystream.h"

#include <cstring>

// Files that are damaged, and files made by an enemy.

namespace
{
constexpr int kCompress = FResourceArchive::kCompressContent;

/// Opens a file in memory and reads all that it claims to have. The number of files; -1 where it doesn't open.
int readAll(std::string bytes)
{
    const IPtr<FMemoryStream> memory =
        adopt(new FMemoryStream(bytes.data(), static_cast<int64>(bytes.size())));
    const IPtr<FResourceArchive> archive = adopt(new FResourceArchive(memory, 0));
    if (!archive->open())
    {
        EXPECT_TRUE(!archive->isOpen() && !archive->getRoot());
        return -1;
    }
    ResourceCheck check(*archive);
    check.run();
    return static_cast<int>(check.getFileCount());
}

void setNumber(std::string& bytes, std::size_t fromEnd, uint32 number)
{
    memcpy(bytes.data() + bytes.size() - fromEnd, &number, sizeof(number));
}

TEST_F(ResourceTest, OpensOrNotWhereverItIsCut)
{
    for (const int flags : {0, kCompress})
    {
        put("src/b.txt", std::string(2000, 'x'));
        ASSERT_TRUE(pack("a.qzr", flags));
        const std::string whole = contentOf("a.qzr");
        EXPECT_EQ(readAll(whole), 5);
        for (std::size_t cut = 0; cut < whole.size(); cut++)
            EXPECT_EQ(readAll(whole.substr(0, cut)), -1) << cut;
        EXPECT_EQ(readAll(whole + "x"), -1);
        for (std::size_t at = 0; at < whole.size(); at++)
            for (const int change : {0x01, 0x80, 0xFF})
            {
                std::string changed = whole;
                changed[at] = static_cast<char>(changed[at] ^ change);
                EXPECT_LE(readAll(changed), 12);
            }
    }
}

TEST_F(ResourceTest, EachNumberOfTheEndIsHeldAgainstTheFile)
{
    ASSERT_TRUE(pack("a.qzr"));
    const std::string whole = contentOf("a.qzr");
    for (const uint32 wrong : {0u, 1u, 0x7FFFFFFFu, 0xFFFFFFFFu, static_cast<uint32>(whole.size())})
    {
        std::string changed = whole;
        setNumber(changed, 16, wrong);
        EXPECT_LE(readAll(changed), 5) << "size of the table " << wrong;
        changed = whole;
        setNumber(changed, 8, wrong);
        EXPECT_EQ(readAll(changed), -1) << "size of the ending " << wrong;
        changed = whole;
        setNumber(changed, 12, wrong);
        EXPECT_EQ(readAll(changed), wrong < 2 ? 0 : 5) << "number of entries " << wrong;
    }
    std::string newer = whole;
    newer[newer.size() - 1] = '3';
    EXPECT_EQ(readAll(newer), -1) << "the older ending for the newer magic";
    std::string unknown = whole;
    unknown[unknown.size() - 1] = '9';
    EXPECT_EQ(readAll(unknown), -1) << "the header is right, the magic unknown";
}

TEST_F(ResourceTest, AWrongCountGivesAPartialTree)
{
    ForgedFile forged;
    forged.file(u"a", "1");
    forged.folder(u"d");
    forged.file(u"b", "2");
    forged.endFolder();
    forged.file(u"c", "3");
    forged.count = 3;
    put("a.qzr", forged.bytes());
    EXPECT_EQ(listing(*opened("a.qzr")), "/a /d/ /d/b ");
    EXPECT_EQ(opened("a.qzr")->getDamage(), 1);
    forged.count = 500;
    put("a.qzr", forged.bytes());
    EXPECT_EQ(listing(*opened("a.qzr")), "/a /c /d/ /d/b ");
    EXPECT_EQ(opened("a.qzr")->getDamage(), 1);
    EXPECT_FALSE(opened("a.qzr")->compact(0, nullptr, nullptr)) << "what is missing would be lost";
}

TEST_F(ResourceTest, FilesOutsideTheDataAreNotThere)
{
    ForgedFile forged;
    forged.file(u"good", "12345");
    forged.entry(FResourceEntry::kFile, 24, 3, u"header");
    forged.entry(FResourceEntry::kFile, 26, 5, u"table");
    forged.entry(FResourceEntry::kFile, 25, 0xFFFFFFFF, u"huge");
    forged.entry(FResourceEntry::kFile, 0xFFFFFFFF, 2, u"far");
    forged.entry(FResourceEntry::kFile, 0xFFFFFFFF, 0, u"empty");
    put("a.qzr", forged.bytes());
    const IPtr<FResourceArchive> archive = opened("a.qzr");
    EXPECT_EQ(listing(*archive), "/empty /good ");
    EXPECT_EQ(archive->getDamage(), 4);
    EXPECT_EQ(read(*archive, u"empty"), "");
    EXPECT_EQ(read(*archive, u"good"), "12345");
}

TEST_F(ResourceTest, TheSameBytesAreNotNamedWithoutEnd)
{
    ForgedFile forged;
    forged.file(u"content", std::string(1000, 'x').c_str());
    for (int i = 0; i < 1000; i++)
        forged.entry(FResourceEntry::kFile, 25, 1000, FString(std::to_string(i).c_str()).text16());
    put("a.qzr", forged.bytes());
    const IPtr<FResourceArchive> archive = opened("a.qzr");
    EXPECT_EQ(listing(*archive), "/content ");
    EXPECT_EQ(archive->getDamage(), 1000);
}

TEST_F(ResourceTest, FoldersDoNotGrowWithoutEnd)
{
    ForgedFile forged;
    for (int i = 0; i < 200000; i++)
        forged.folder(u"d");
    put("a.qzr", forged.bytes());
    const IPtr<FResourceArchive> archive = opened("a.qzr");
    ASSERT_NE(archive, nullptr);
    FPath top(u"/", FPath::kFolder);
    EXPECT_LE(archive->countFiles(&top, true, true, nullptr), FResourceArchive::kMaxDepth + 1);
    EXPECT_GT(archive->getDamage(), 0);
}

TEST_F(ResourceTest, ManyEntriesInTheWorstOrderAreSortedOnce)
{
    ForgedFile forged;
    for (char16 first = 0x7F; first > 0x20; first--)
        for (char16 second = 0x7F; second > 0x20; second--)
            for (char16 third = 0x2F; third > 0x20; third--)
            {
                const char16 name[] = {first, second, third, 0};
                forged.entry(FResourceEntry::kFile, 25, 0, name);
            }
    put("a.qzr", forged.bytes());
    const IPtr<FResourceArchive> archive = opened("a.qzr");
    EXPECT_EQ(archive->getRoot()->getChildren().size(), 95u * 95u * 15u);
    EXPECT_EQ(utf8(archive->getRoot()->getChildren()[0]->getName()), "!!!");
    EXPECT_EQ(read(*archive, u"abc"), "null");
    EXPECT_EQ(read(*archive, u"ab+"), "");
}

TEST_F(ResourceTest, NothingIsExtractedElsewhere)
{
    std::filesystem::create_directories(root + "/out/real");
    std::filesystem::create_directories(root + "/elsewhere");
    std::filesystem::create_symlink(root + "/elsewhere", root + "/out/link");
    std::filesystem::create_symlink(root + "/target", root + "/out/file");
    put("target", "old");
    ForgedFile forged;
    forged.file(u"../up", "x");
    forged.file(u"..", "x");
    forged.file(u".", "x");
    forged.file(u"", "x");
    forged.file(u"/tmp/absolute", "x");
    forged.file(u"..\\..\\back", "x");
    forged.file(u"file", "x");
    forged.folder(u"link");
    forged.file(u"in", "x");
    forged.endFolder();
    forged.folder(u"../elsewhere");
    forged.file(u"in", "x");
    forged.endFolder();
    forged.file(u"real", "x");
    forged.file(u"good", "x");
    put("a.qzr", forged.bytes());
    const IPtr<FResourceArchive> archive = opened("a.qzr");
    EXPECT_FALSE(archive->extractAll(*at("out", FPath::kFolder), nullptr));
    EXPECT_EQ(archive->getLeftOut().getCount(), 10);
    EXPECT_EQ(contentOf("out/good"), "x");
    EXPECT_EQ(contentOf("target"), "old");
    EXPECT_TRUE(std::filesystem::is_empty(root + "/elsewhere"));
    EXPECT_FALSE(exists("up") || exists("back") || std::filesystem::exists("/tmp/absolute"));
    EXPECT_EQ(std::distance(std::filesystem::directory_iterator(root + "/out"), {}), 4);
}

TEST_F(ResourceTest, ExtractionReplacesWholeFilesOnly)
{
    ForgedFile forged;
    forged.file(u"good", "new");
    forged.entry(FResourceEntry::kFile | FResourceEntry::kFolder, 0, 0, u"folder");
    forged.file(u"in", "x");
    forged.endFolder();
    put("a.qzr", forged.bytes());
    std::filesystem::create_directories(root + "/out");
    put("out/good", "old");
    put("out/folder", "a file");
    std::filesystem::create_hard_link(root + "/out/good", root + "/other name");
    const IPtr<FResourceArchive> archive = opened("a.qzr");
    EXPECT_FALSE(archive->extractAll(*at("out", FPath::kFolder), nullptr));
    EXPECT_EQ(contentOf("out/good"), "new");
    EXPECT_EQ(contentOf("other name"), "old");
    EXPECT_EQ(contentOf("out/folder"), "a file");
    ASSERT_EQ(archive->getLeftOut().getCount(), 1);
    EXPECT_EQ(utf8(archive->getLeftOut().getTexts()[0]), "/folder");

    FPath good(u"good", FPath::kFile);
    FFileArchiveNode* node = archive->lookupNode(&good);
    put("fresh", "kept");
    static_cast<FResourceEntry*>(node)->setDataOffset(1 << 20);
    EXPECT_FALSE(archive->extractFile(node, *at("fresh"), nullptr));
    EXPECT_EQ(contentOf("fresh"), "kept") << "a damaged content takes no file away";
    EXPECT_FALSE(exists("extracted") || exists("out/extracted"));
}

TEST_F(ResourceTest, WhatIsSaidOfASmallFileStaysSmall)
{
    ForgedFile forged;
    const std::u16string longName(255, u'n');
    for (int i = 0; i < FResourceArchive::kMaxDepth; i++)
        forged.folder(longName.c_str());
    for (int i = 0; i < 1000; i++)
        forged.entry(FResourceEntry::kFile, 25, 0, u"/");
    put("a.qzr", forged.bytes());
    const IPtr<FResourceArchive> archive = opened("a.qzr");
    ResourceCheck check(*archive);
    EXPECT_FALSE(check.run());
    EXPECT_GE(check.getProblems().getCount(), 1000);
    uint64 length = 0;
    for (const FString& text : check.getProblems().getTexts())
        length += text.length();
    EXPECT_LE(length, BoundedTexts::kMaxCharacters);
    EXPECT_EQ(check.getProblems().getOmitted() + static_cast<int64>(check.getProblems().getTexts().size()),
              check.getProblems().getCount());
}

TEST_F(ResourceTest, AContentOfTheWrongLengthIsNotExtracted)
{
    ASSERT_TRUE(pack("a.qzr", kCompress));
    const IPtr<FResourceArchive> archive = opened("a.qzr");
    FPath text(u"b.txt", FPath::kFile);
    auto* entry = static_cast<FResourceEntry*>(archive->lookupNode(&text));
    for (const int wrong : {-1, 1})
    {
        entry->setCompressed(entry->getDataSize(), static_cast<int64>(longText().size()) + wrong);
        EXPECT_FALSE(archive->extractFile(entry, *at("out"), nullptr));
        EXPECT_FALSE(exists("out"));
        ResourceCheck check(*archive);
        EXPECT_FALSE(check.run());
        EXPECT_EQ(utf8(check.getProblems().getTexts()[0]),
                  "/b.txt: the content isn't as long as the table says");
    }
}

TEST_F(ResourceTest, TheCheckFindsWhatOverlapsAndWhatIsThereTwice)
{
    ForgedFile forged;
    forged.file(u"a", "12345");
    forged.data.writeString8("a gap", false);
    forged.entry(FResourceEntry::kFile, 27, 2, u"b");
    forged.entry(FResourceEntry::kFile, 25, 0, u"b");
    put("a.qzr", forged.bytes());
    const IPtr<FResourceArchive> archive = opened("a.qzr");
    ResourceCheck check(*archive);
    EXPECT_FALSE(check.run());
    ASSERT_EQ(check.getProblems().getCount(), 2);
    EXPECT_EQ(utf8(check.getProblems().getTexts()[0]), "/b: the name is there twice");
    EXPECT_EQ(utf8(check.getProblems().getTexts()[1]), "/b: the content overlaps another file's");
}

TEST_F(ResourceTest, ACompressedEntryCannotClaimMoreThanItsBytesHold)
{
    ASSERT_TRUE(pack("a.qzr", kCompress));
    std::string bytes = contentOf("a.qzr");
    // The plain size of "b.txt", the only compressed file, stands right before its name.
    const std::size_t name = bytes.rfind("b.txt");
    const int64 claimed = int64{1} << 40;
    memcpy(bytes.data() + name - sizeof(claimed), &claimed, sizeof(claimed));
    put("a.qzr", bytes);
    const IPtr<FResourceArchive> archive = opened("a.qzr");
    EXPECT_EQ(archive->getDamage(), 1);
    EXPECT_EQ(read(*archive, u"b.txt"), "null");
    EXPECT_EQ(read(*archive, u"b/two"), "22");
}

TEST(ArchiveName, TellsSafeNames)
{
    for (const char16* name : {u"a", u"...", u"..a", u" ", u"a b"})
        EXPECT_TRUE(ArchiveName::isSafe(name)) << utf8(name);
    for (const char16* name : {u"", u".", u"..", u"a/b", u"/", u"a\\b"})
        EXPECT_FALSE(ArchiveName::isSafe(name)) << utf8(name);
    EXPECT_TRUE(ArchiveName::isStorable(FString(std::u16string(255, u'\u00E4').c_str())));
    EXPECT_FALSE(ArchiveName::isStorable(FString(std::u16string(256, u'a').c_str())));
    const char16 stray[] = {u'a', 0xDCFF, 0};
    EXPECT_FALSE(ArchiveName::isStorable(stray));
    EXPECT_TRUE(ArchiveName::isStorable(u"\U0001F3B5"));
}
} // namespace
