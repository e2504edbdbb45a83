#include "storage/resource/fresourcearchive.h"

#include "containers/value/cmtime.h"
#include "foundation/text/iuseralert.h"
#include "resourcefixture.h"
#include "storage/filesystem/ffileiterator.h"
#include "storage/resource/fconsole.h"
#include "storage/resource/resourcecheck.h"
#include "storage/stream/fcompressionstream.h"
#include "storage/stream/fstreamunpacker.h"

#include <cstring>

namespace
{
constexpr int kCompress = FResourceArchive::kCompressContent;

struct Alerts : IUserAlert
{
    Alerts() { IUserAlert::set(this); }
    ~Alerts() override { IUserAlert::set(nullptr); }
    int run(const char16* text, int style, const char16*, const char16*, const char16*) override
    {
        shown += utf8(text) + "|" + std::to_string(style);
        return 1;
    }

    std::string shown;
};

struct Lines : FConsole
{
    void printLine(const ConstString& line) override { text += utf8(line) + "\n"; }

    std::string text;
};

int32 lastNumber(const std::string& bytes, std::size_t fromEnd)
{
    int32 number = 0;
    memcpy(&number, bytes.data() + bytes.size() - fromEnd, sizeof(number));
    return number;
}

TEST_F(ResourceTest, AFolderComesBackAsItWas)
{
    for (const int flags : {0, kCompress})
        for (const int access : {0, 2, 4, 6})
        {
            ASSERT_TRUE(pack("a.qzr", flags));
            const IPtr<FResourceArchive> archive = opened("a.qzr", access);
            ASSERT_NE(archive, nullptr);
            EXPECT_EQ(archive->getVersion(), flags ? 3 : 1);
            EXPECT_EQ(listing(*archive), "/b/ /b/one /b/two /b.txt /empty/ /zero /\u00FCml\u00E4ut ");
            EXPECT_EQ(read(*archive, u"b.txt"), longText());
            EXPECT_EQ(read(*archive, u"/b/two"), "22");
            EXPECT_EQ(read(*archive, u"zero"), "");
            EXPECT_EQ(read(*archive, u"b"), "null");
            EXPECT_EQ(read(*archive, u"b/one/x"), "null");
            EXPECT_EQ(read(*archive, u"../src/b/one"), "null");
            FPath text(u"b.txt", FPath::kFile), top(u"/", FPath::kFolder);
            EXPECT_EQ(archive->getFileSize(&text), static_cast<int64>(longText().size()));
            EXPECT_EQ(archive->isBitwiseCopyable(&text), flags == 0);
            int64 bytes = 0;
            EXPECT_EQ(archive->countFiles(&top, true, true, &bytes), 7);
            EXPECT_EQ(archive->countFiles(&top, false, false, nullptr), 3);
            EXPECT_EQ(bytes, static_cast<int64>(longText().size() + 4));
            EXPECT_TRUE(archive->extractAll(*at("out", FPath::kFolder), nullptr));
            EXPECT_EQ(contentOf("out/b.txt"), longText());
            EXPECT_EQ(contentOf("out/\u00FCml\u00E4ut"), "u");
            EXPECT_TRUE(exists("out/empty") && exists("out/zero"));
            EXPECT_TRUE(ResourceCheck(*archive).run());
            std::filesystem::remove_all(root + "/out");
        }
}

TEST_F(ResourceTest, TheSameFolderGivesTheSameBytes)
{
    ASSERT_TRUE(pack("a.qzr", kCompress) && pack("first.qzr"));
    // The same files, made in another order, at another time.
    std::filesystem::rename(root + "/src", root + "/old");
    std::filesystem::create_directories(root + "/src/empty");
    for (const char* name : {"zero", "b.txt", "\u00FCml\u00E4ut"})
        put(std::string("src/") + name, contentOf(std::string("old/") + name));
    std::filesystem::create_directories(root + "/src/b");
    put("src/b/two", "22");
    put("src/b/one", "1");
    ASSERT_TRUE(pack("b.qzr", kCompress) && pack("second.qzr"));
    EXPECT_EQ(contentOf("a.qzr"), contentOf("b.qzr"));
    EXPECT_EQ(contentOf("first.qzr"), contentOf("second.qzr"));
}

TEST_F(ResourceTest, TheFormIsThatOfTheFirstVersion)
{
    std::filesystem::remove_all(root + "/src");
    std::filesystem::create_directories(root + "/src/d");
    put("src/f", "xyz");
    ASSERT_TRUE(pack("a.qzr"));
    ForgedFile expected;
    expected.entry(1 | 8, 0, 0, u"d");
    expected.entry(1 | 8, 0, 0, u"..");
    expected.entry(2 | 8, 25, 3, u"f");
    expected.data.writeString8("xyz", false);
    EXPECT_EQ(contentOf("a.qzr"), expected.bytes());

    std::filesystem::remove_all(root + "/src");
    std::filesystem::create_directories(root + "/src");
    ASSERT_TRUE(pack("a.qzr"));
    EXPECT_EQ(contentOf("a.qzr"), ForgedFile().bytes()) << "header and ending, no entries";
    EXPECT_NE(opened("a.qzr"), nullptr);
    ASSERT_TRUE(pack("a.qzr", kCompress));
    const std::string bytes = contentOf("a.qzr");
    EXPECT_EQ(bytes.size(), 25u + 48u);
    EXPECT_EQ(bytes.substr(25, 32), "6D1F0C523E8B4A97B02E7D15C94A68F3");
    EXPECT_EQ(lastNumber(bytes, 8), 48);
    EXPECT_EQ(bytes.substr(bytes.size() - 4), "QZR3");
}

TEST_F(ResourceTest, WhatGetsNoSmallerIsStoredAsItIs)
{
    ASSERT_TRUE(pack("a.qzr", kCompress));
    const IPtr<FResourceArchive> archive = opened("a.qzr");
    FPath small(u"b/two", FPath::kFile), large(u"b.txt", FPath::kFile);
    const auto* plain = static_cast<FResourceEntry*>(archive->lookupNode(&small));
    const auto* packed = static_cast<FResourceEntry*>(archive->lookupNode(&large));
    EXPECT_FALSE(plain->isCompressed());
    EXPECT_EQ(plain->getDataSize(), plain->getFileSize());
    EXPECT_TRUE(packed->isCompressed());
    EXPECT_LT(packed->getDataSize(), packed->getFileSize());
    FStream* stream = archive->openFile(&large, kFileRead, nullptr);
    EXPECT_EQ(archive->getFileSize(stream), packed->getFileSize());
    FStreamUnpacker unpacker(stream);
    EXPECT_EQ(archive->getFileSize(unpacker.getStream()), packed->getFileSize());
    archive->closeFile(stream);
    EXPECT_EQ(archive->openFile(&large, kFileReadWrite, nullptr), nullptr);
}

TEST_F(ResourceTest, WithoutItsEngineItDoesNotOpen)
{
    ASSERT_TRUE(pack("a.qzr", kCompress) && pack("plain.qzr"));
    FComponentRegistry empty;
    FComponentRegistry* const full = std::exchange(gComponentRegistry, &empty);
    Alerts alerts;
    EXPECT_EQ(opened("a.qzr"), nullptr);
    EXPECT_EQ(alerts.shown, "") << "nobody asked for warnings";
    const IPtr<FResourceArchive> archive = adopt(new FResourceArchive(at("a.qzr"), 0));
    archive->displayWarnings(true);
    EXPECT_FALSE(archive->open());
    EXPECT_EQ(alerts.shown, "Resource File Error: Compression not supported!|0");
    EXPECT_FALSE(archive->isOpen());
    EXPECT_EQ(archive->getRoot(), nullptr);
    EXPECT_NE(opened("plain.qzr"), nullptr);
    EXPECT_FALSE(pack("new.qzr", kCompress));
    EXPECT_FALSE(exists("new.qzr"));
    gComponentRegistry = full;
}

TEST_F(ResourceTest, VersionsAreToldByTheirMagic)
{
    EXPECT_EQ(getMagicVersion(resourceMagic("QZRF")), 1);
    EXPECT_EQ(getMagicVersion(resourceMagic("QZR2")), 2);
    EXPECT_EQ(getMagicVersion(resourceMagic("QZR3")), 3);
    EXPECT_EQ(getMagicVersion(resourceMagic("QZR4")), 0);
    EXPECT_EQ(getVersionSize(1), 16);
    EXPECT_EQ(getVersionSize(2), 48);
    EXPECT_EQ(getVersionMagic(9), resourceMagic("QZR3"));

    registerArchiveFormat(resourceMagic("HOS7"), 7, false);
    EXPECT_EQ(getMagicVersion(resourceMagic("HOS7")), 7);
    EXPECT_EQ(getVersionMagic(7), resourceMagic("QZR3")) << "that one is only read";
    registerArchiveFormat(resourceMagic("HST7"), 7, true);
    gFormatVersion = 7;
    ASSERT_TRUE(pack("a.qzr"));
    gFormatVersion = 0;
    const std::string bytes = contentOf("a.qzr");
    EXPECT_EQ(bytes.substr(bytes.size() - 4), "HST7");
    EXPECT_EQ(bytes.substr(bytes.size() - 48, 32), std::string(32, 0));
    const IPtr<FResourceArchive> archive = opened("a.qzr");
    ASSERT_NE(archive, nullptr);
    EXPECT_EQ(read(*archive, u"b.txt"), longText());
}

TEST_F(ResourceTest, StreamsWithHandlesOfTheirOwnKeepItOpen)
{
    ASSERT_TRUE(pack("a.qzr"));
    IPtr<FResourceArchive> archive = opened("a.qzr", FFileArchive::kOwnHandles);
    FPath one(u"b/one", FPath::kFile), two(u"b/two", FPath::kFile);
    FStream* first = archive->openFile(&one, kFileRead, nullptr);
    FStream* second = archive->openFile(&two, kFileRead, nullptr);
    EXPECT_FALSE(archive->close());
    EXPECT_FALSE(archive->compact(kCompress, nullptr, nullptr));
    EXPECT_TRUE(archive->isOpen());
    archive->closeFile(first);
    FResourceArchive* const seen = archive;
    archive = nullptr;
    char byte = 0;
    EXPECT_TRUE(second->readChar8(byte)) << "a stream keeps its archive";
    EXPECT_EQ(byte, '2');
    EXPECT_TRUE(seen->hasOpenStreams());
    second->release();
}

TEST_F(ResourceTest, CanBeInAStream)
{
    const IPtr<FMemoryStream> memory = adopt(new FMemoryStream);
    const IPtr<FResourceArchive> archive = adopt(new FResourceArchive(memory, FFileArchive::kOwnHandles));
    ASSERT_TRUE(archive->create(at("src", FPath::kFolder), kCompress, nullptr));
    ASSERT_TRUE(archive->open());
    EXPECT_EQ(read(*archive, u"b.txt"), longText());
    EXPECT_EQ(read(*archive, u"b/two"), "22");
    EXPECT_EQ(archive->getArchivePath(), nullptr);
    EXPECT_TRUE(archive->close());
    EXPECT_TRUE(pack("a.qzr", kCompress));
    EXPECT_EQ(contentOf("a.qzr"),
              std::string(memory->getData(), static_cast<std::size_t>(memory->getSize())));
}

TEST_F(ResourceTest, RebuildsInPlace)
{
    ASSERT_TRUE(pack("a.qzr") && pack("packed.qzr", kCompress));
    IPtr<FResourceArchive> archive = opened("a.qzr");
    ASSERT_TRUE(archive->compact(kCompress, nullptr, nullptr));
    EXPECT_EQ(contentOf("a.qzr"), contentOf("packed.qzr"));
    EXPECT_EQ(read(*archive, u"b.txt"), longText()) << "open again";

    put("new", "another content");
    FPath two(u"b/two", FPath::kFile), missing(u"b/three", FPath::kFile), folder(u"b", FPath::kFolder);
    ASSERT_TRUE(archive->replaceFileInArchive(&two, at("new"), 0, nullptr, nullptr));
    EXPECT_EQ(read(*archive, u"b/two"), "another content");
    EXPECT_EQ(read(*archive, u"b.txt"), longText());
    EXPECT_EQ(archive->getVersion(), 1);
    EXPECT_FALSE(archive->replaceFileInArchive(&missing, at("new"), 0, nullptr, nullptr));
    EXPECT_FALSE(archive->replaceFileInArchive(&folder, at("new"), 0, nullptr, nullptr));
    const std::string before = contentOf("a.qzr");
    EXPECT_FALSE(archive->replaceFileInArchive(&two, at("no such file"), 0, nullptr, nullptr));
    EXPECT_EQ(contentOf("a.qzr"), before);
    EXPECT_EQ(read(*archive, u"b/two"), "another content");
    EXPECT_FALSE(exists("a-01.qzr")) << "nothing is left beside it";

    std::filesystem::create_symlink("a.qzr", root + "/link.qzr");
    EXPECT_TRUE(opened("link.qzr")->compact(kCompress, nullptr, nullptr));
    EXPECT_TRUE(std::filesystem::is_symlink(root + "/link.qzr"));
    EXPECT_EQ(opened("a.qzr")->getVersion(), 3);
}

TEST_F(ResourceTest, RebuiltKeepsItsRights)
{
    using std::filesystem::perms;
    ASSERT_TRUE(pack("a.qzr"));
    const perms owner = perms::owner_read | perms::owner_write;
    for (const perms rights :
         {owner, owner | perms::group_read, owner | perms::group_read | perms::others_read})
    {
        std::filesystem::permissions(root + "/a.qzr", rights);
        ASSERT_TRUE(opened("a.qzr")->compact(0, nullptr, nullptr));
        EXPECT_EQ(std::filesystem::status(root + "/a.qzr").permissions(), rights);
    }
}

TEST_F(ResourceTest, FilesOutsideStandForNodes)
{
    ASSERT_TRUE(pack("a.qzr"));
    const IPtr<FResourceArchive> archive = opened("a.qzr");
    FPath two(u"b/two", FPath::kFile);
    FFileArchiveNode* node = archive->lookupNode(&two);
    EXPECT_FALSE(archive->checkUpdatedNodes(false));
    put("outside", "from outside");
    node->setReference(at("outside"));
    EXPECT_EQ(read(*archive, u"b/two"), "from outside");
    EXPECT_EQ(archive->getFileSize(&two), 12);
    CmTime created, modified;
    EXPECT_TRUE(archive->getFileTimes(&two, created, modified));
    std::filesystem::last_write_time(root + "/a.qzr", std::filesystem::file_time_type::clock::now());
    std::filesystem::last_write_time(root + "/outside",
                                     std::filesystem::file_time_type::clock::now() - std::chrono::hours(1));
    EXPECT_FALSE(archive->checkUpdatedNodes(false)) << "older than the archive";
    std::filesystem::last_write_time(root + "/outside",
                                     std::filesystem::file_time_type::clock::now() + std::chrono::hours(1));
    EXPECT_TRUE(archive->checkUpdatedNodes(false));
    std::filesystem::remove(root + "/outside");
    EXPECT_TRUE(archive->checkUpdatedNodes(true));
    EXPECT_EQ(read(*archive, u"b/two"), "22") << "its own content again";
}

TEST_F(ResourceTest, ShowsItsContent)
{
    ForgedFile forged;
    forged.folder(u"d");
    forged.file(u"f", "xyz");
    forged.endFolder();
    put("a.qzr", forged.bytes());
    const IPtr<FResourceArchive> archive = opened("a.qzr");
    Lines lines;
    archive->dumpContent(&lines);
    EXPECT_EQ(lines.text, "<root>\n  <d>\n    \"f\" size = 3 Bytes, offset = 25\n");
    EXPECT_EQ(archive->findEndOfDataSection(), 28);
    archive->updateNodeOffsets(5);
    EXPECT_EQ(archive->findEndOfDataSection(), 33);
}

TEST_F(ResourceTest, HasAFolderForWhatOthersOpen)
{
    ASSERT_TRUE(pack("a.qzr"));
    const IPtr<FResourceArchive> shared = opened("a.qzr");
    const std::string all = utf8(folders.temp) + "/~Cache/File Archive";
    EXPECT_EQ(fullPathOf(*shared->getCacheFolder()), all + "/a.qzr");
    EXPECT_TRUE(std::filesystem::is_directory(all + "/a.qzr"));

    const IPtr<FResourceArchive> own = opened("a.qzr", FFileArchive::kPrivateCache);
    const std::string name = utf8(own->getCacheFolder()->getName());
    EXPECT_TRUE(name.size() == 11 && name[0] == '(' && name.substr(5) == ")a.qzr") << name;
    EXPECT_FALSE(std::filesystem::exists(all + "/" + name)) << "not made at once";
    own->setCacheFolder(at("cache", FPath::kFolder));
    FPath two(u"b/two", FPath::kFile);
    FNPath place;
    ASSERT_TRUE(own->makeCachedPath(place, own->lookupNode(&two)));
    EXPECT_EQ(fullPathOf(place), root + "/cache/b/two");
    EXPECT_TRUE(own->extractFile(own->lookupNode(&two), place, nullptr));
    EXPECT_EQ(contentOf("cache/b/two"), "22");
}

TEST_F(ResourceTest, CopiesOut)
{
    ASSERT_TRUE(pack("a.qzr", kCompress));
    const IPtr<FResourceArchive> archive = opened("a.qzr");
    FPath text(u"/b.txt", FPath::kFile), folder(u"/b", FPath::kFolder);
    EXPECT_TRUE(archive->copyFile(&text, at("out"), nullptr, nullptr));
    EXPECT_EQ(contentOf("out"), longText());
    std::filesystem::create_directory(root + "/folder");
    EXPECT_TRUE(archive->copyFile(&text, at("folder", FPath::kFolder), nullptr, nullptr));
    EXPECT_EQ(contentOf("folder/b.txt"), longText());
    EXPECT_FALSE(archive->copyFile(&folder, at("out2"), nullptr, nullptr));
    EXPECT_FALSE(archive->copyFile(&text, at("missing", FPath::kFolder), nullptr, nullptr));
}
} // namespace
