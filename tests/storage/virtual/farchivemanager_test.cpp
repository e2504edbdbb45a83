#include "storage/virtual/farchivemanager.h"

#include "foundation/thread/fthread.h"
#include "storage/stream/fmemorystream.h"
#include "storage/url/furl.h"
#include "tests/storage/filefixture.h"

#include <atomic>
#include <thread>

namespace
{
/// Holds one file of any name, whose content is its own path.
class EchoFiles : public FFileSystem
{
    DECLARE_TYPE(EchoFiles, FFileSystem)

    CmObject* newCopy() const override { return nullptr; }
    FStream* openFile(FPath* path, int, int*) override
    {
        const std::string text = fullPathOf(*path);
        auto* stream = new FMemoryStream;
        stream->writeRaw(text.data(), static_cast<int64>(text.size()));
        stream->rewind();
        return stream;
    }
    bool fileExists(FPath*) override { return true; }
    bool isBitwiseCopyable(FPath* path) override { return fullPathOf(*path) != "/packed"; }
};

class ArchiveManagerTest : public FileTest
{
protected:
    void SetUp() override
    {
        FileTest::SetUp();
        manager = FArchiveManager::instance();
    }
    void TearDown() override
    {
        FArchiveManager::terminate();
        FileTest::TearDown();
    }

    std::string opened(FPath* path)
    {
        FStream* stream = files->openFile(path, kFileRead, nullptr);
        if (!stream)
            return "null";
        char content[200] = {};
        stream->readRaw(content, 199);
        files->closeFile(stream);
        return content;
    }

    FArchiveManager* manager = nullptr;
    IPtr<EchoFiles> echo = adopt(new EchoFiles);
};

TEST_F(ArchiveManagerTest, EachRegistrationNeedsItsEnd)
{
    EXPECT_TRUE(manager->registerArchive(echo, u"Sounds", u"Sounds"));
    EXPECT_TRUE(manager->registerArchive(echo, u"Sounds", u"sOUNDS")) << "case makes no other key";
    EXPECT_EQ(manager->getUseCount(u"sounds"), 2);
    const IPtr<EchoFiles> other = adopt(new EchoFiles);
    EXPECT_TRUE(manager->registerArchive(other, u"Sounds", u"sounds"));
    const IPtr<FFileSystem> found = adopt(manager->lookupArchive(u"Sounds"));
    EXPECT_EQ(found.get(), echo.get()) << "who was first stays";
    EXPECT_FALSE(manager->unregisterArchive(other));

    EXPECT_TRUE(manager->unregisterArchive(echo));
    EXPECT_TRUE(manager->unregisterArchive(echo));
    EXPECT_TRUE(manager->containsArchive(u"sounds"));
    EXPECT_TRUE(manager->unregisterArchive(echo));
    EXPECT_FALSE(manager->containsArchive(u"sounds"));
    EXPECT_FALSE(manager->unregisterArchive(echo));
    EXPECT_EQ(echo->getRefCount(), 2u) << "ours and the one that was found";
}

TEST_F(ArchiveManagerTest, NamesAreNeeded)
{
    EXPECT_FALSE(manager->registerArchive(echo, u"", u"key"));
    EXPECT_FALSE(manager->registerArchive(echo, u"name", u""));
    EXPECT_FALSE(manager->registerArchive(nullptr, u"name", u"key"));
    const IPtr<ArchiveEntry> entry = adopt(ArchiveEntry::create(echo, u"Name", u"kéy"));
    EXPECT_EQ(utf8(entry->getKey()), "KÉY");
    EXPECT_EQ(utf8(entry->getName()), "Name");
}

TEST_F(ArchiveManagerTest, ArchivePathsBeginWithAKnownProtocol)
{
    for (const char16* text :
         {u"vfs://a", u"archive://a/b", u"qzr://a", u"tonerack://", u"tonepack://a", u"Archive://a"})
        EXPECT_TRUE(FArchiveManager::isArchivePath(FString(text))) << utf8(text);
    for (const char16* text : {u"", u"archive", u"archive:/a", u"http://a", u"/archive://a", u"x archive://a",
                               u"arch://a", u"://a", u"archive1://a"})
        EXPECT_FALSE(FArchiveManager::isArchivePath(FString(text))) << utf8(text);

    EXPECT_EQ(FArchiveManager::findFirstProtocolPostfix(u"http://a"), 4);
    EXPECT_EQ(FArchiveManager::findFirstProtocolPostfix(u"a1:vfs://a"), 6);
    EXPECT_EQ(FArchiveManager::findFirstProtocolPostfix(u"a1://a"), -1);
    EXPECT_EQ(FArchiveManager::findFirstProtocolPostfix(u"://a"), -1);
}

TEST_F(ArchiveManagerTest, KnowsRoots)
{
    EXPECT_TRUE(FArchiveManager::isRoot(u"archive://name"));
    EXPECT_TRUE(FArchiveManager::isRoot(u"archive://name/"));
    for (const char16* text :
         {u"archive://name/a", u"archive://", u"archive:///", u"archive:/name", u"/a://name", u"://name",
          u"name", u"averylongprotocol://name", u"archive://name//"})
        EXPECT_FALSE(FArchiveManager::isRoot(text)) << utf8(text);
}

TEST_F(ArchiveManagerTest, PathsOfAllKindsLeadIntoArchives)
{
    ASSERT_TRUE(manager->registerArchive(echo, u"my box", u"my box"));
    FPath plain(u"archive://My Box/a/b.png", FPath::kFile);
    FNPath native(u"vfs://my box/a/b.png", FPath::kFile);
    FUrl url(u"archive://my%20box/a%20b.png");
    EXPECT_EQ(opened(&plain), "/a/b.png");
    EXPECT_EQ(opened(&native), "/a/b.png");
    EXPECT_EQ(opened(&url), "/a b.png");
    EXPECT_TRUE(files->fileExists(&plain));
    EXPECT_EQ(files->getDriveType(&native), FNFileSystem::kArchiveDrive);

    FNPath unknown(u"vfs://nobody/a", FPath::kFile);
    EXPECT_EQ(manager->getFileSystem(&unknown), nullptr);
    EXPECT_EQ(opened(&unknown), "null");
    put("here", "native");
    EXPECT_EQ(manager->getFileSystem(at("here")), nullptr);
    EXPECT_EQ(opened(at("here")), "native");
}

TEST_F(ArchiveManagerTest, TellsWhereBytesAreTheFile)
{
    ASSERT_TRUE(manager->registerArchive(echo, u"box", u"box"));
    FPath plain(u"archive://box/plain", FPath::kFile), packed(u"archive://box/packed", FPath::kFile);
    EXPECT_TRUE(manager->isBitwiseCopyable(&plain));
    EXPECT_FALSE(manager->isBitwiseCopyable(&packed));
    EXPECT_TRUE(manager->isBitwiseCopyable(at("on disk")));
}

TEST_F(ArchiveManagerTest, ServesOtherThreadsWhileArchivesComeAndGo)
{
    std::atomic<bool> isOver{false};
    std::atomic<int> found{0};
    auto reader = [&]
    {
        while (!isOver)
        {
            FNPath path(u"vfs://box/a", FPath::kFile);
            if (opened(&path) == "/a")
                found++;
        }
    };
    std::thread first(reader), second(reader);
    while (found < 200)
    {
        manager->registerArchive(echo, u"box", u"box");
        std::this_thread::yield();
        manager->unregisterArchive(echo);
    }
    isOver = true;
    first.join();
    second.join();
    EXPECT_EQ(echo->getRefCount(), 1u);
}

TEST_F(ArchiveManagerTest, ANewOneComesAfterTheEnd)
{
    FArchiveManager::terminate();
    EXPECT_EQ(IArchiveLookup::instance(), nullptr);
    manager = FArchiveManager::instance();
    EXPECT_EQ(IArchiveLookup::instance(), manager);
}
} // namespace
