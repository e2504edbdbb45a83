#include "storage/filesystem/fnmonitor.h"

#include "foundation/message/fmessage.h"
#include "foundation/message/fmessenger.h"
#include "foundation/thread/fthread.h"
#include "storage/filesystem/filesystemchange.h"
#include "storage/filesystem/ifilesystemlistener.h"
#include "tests/storage/filefixture.h"

#include <atomic>
#include <thread>
#include <vector>

namespace
{
class Listener : public IFileSystemListener
{
public:
    void onFileSystemChanged(const FileSystemChange& change) override
    {
        std::string text = std::to_string(change.getKind()) + " " + fullPathOf(*change.getPath());
        if (change.getNewPath())
            text += " " + fullPathOf(*change.getNewPath());
        heard.push_back(text);
    }

    std::vector<std::string> heard;
};

/// A receiver of mount events.
class MountListener : public CmObject
{
public:
    int notify(FMessage* message) override
    {
        heard += std::string(message->getMessageID()) + " " +
                 fullPathOf(*FCast(FNPath, message->get("kRootPath")));
        return 1;
    }

    std::string heard;
};

class FNMonitorTest : public FileTest
{
protected:
    void SetUp() override
    {
        FileTest::SetUp();
        root = std::filesystem::canonical(root).string();
        gMessenger = messenger;
        monitor = FNMonitor::instance();
    }

    void TearDown() override
    {
        monitor->removeRegistry(&listener);
        termFNMonitor();
        gMessenger = nullptr;
        FileTest::TearDown();
    }

    /// What the listener heard, after at least one change has arrived.
    std::vector<std::string> nextChanges()
    {
        while (listener.heard.empty())
        {
            FThreadSleep(5);
            messenger->deliverMessages();
        }
        return std::move(listener.heard);
    }

    IPtr<FMessenger> messenger = adopt(new FMessenger);
    FNMonitor* monitor = nullptr;
    Listener listener;
};

using Changes = std::vector<std::string>;

TEST_F(FNMonitorTest, TellsOfChangesByOthers)
{
    ASSERT_TRUE(monitor->start());
    std::filesystem::create_directory(root + "/watched");
    ASSERT_TRUE(monitor->registerPath(&listener, at("watched")));
    for (int i = 0; i < 50; i++)
        put("watched/file" + std::to_string(i), "x");
    EXPECT_EQ(nextChanges().front(), "3 " + root + "/watched");
    std::filesystem::remove_all(root + "/watched");
    int told = 1;
    Changes changes = nextChanges();
    for (; changes.back() != "2 " + root + "/watched"; changes = nextChanges())
        told += static_cast<int>(changes.size());
    EXPECT_LT(told, 50) << "a burst is one change, not one for each file";
}

TEST_F(FNMonitorTest, TellsOfChangesByTheProgram)
{
    EXPECT_TRUE(monitor->start());
    Listener other;
    const IPtr<FNPath> elsewhere = at("elsewhere", FPath::kFolder);
    files->createDir(elsewhere);
    EXPECT_TRUE(monitor->registerPath(&other, elsewhere));
    EXPECT_TRUE(monitor->registerPath(&listener, at("", FPath::kFolder)));
    messenger->killMessages(monitor, nullptr);
    files->onFileSystemChange(FileSystemChange::kWritten, at("sub/a"), nullptr);
    files->onFileSystemChange(FileSystemChange::kWritten, at("sub/a"), at("deep/er/b"));
    EXPECT_EQ(messenger->messagesPosted(monitor, "PathChanged"), 2);
    messenger->deliverMessages();
    EXPECT_EQ(listener.heard, (Changes{"1 " + root + "/sub", "1 " + root + "/sub " + root + "/deep/er"}));
    EXPECT_TRUE(other.heard.empty());
    monitor->removeRegistry(&other);
}

TEST_F(FNMonitorTest, ReportsWhatTheFileSystemDoes)
{
    EXPECT_TRUE(monitor->start());
    write(at("a"), "x");
    messenger->deliverMessages();
    EXPECT_TRUE(monitor->registerPath(&listener, at("", FPath::kFolder)));
    monitor->stop();
    write(at("a"), "x");
    EXPECT_FALSE(messenger->areMessagesPosted(static_cast<CmObject*>(monitor), nullptr)) << "nobody watches";
    EXPECT_TRUE(monitor->start());
    FStream* stream = files->openFile(at("a"), kFileRead, nullptr);
    files->closeFile(stream);
    files->openFile(at("a"), kFileRead, nullptr)->release();
    files->openFile(at("a"), kFileReadWrite, nullptr)->release();
    files->moveFile(at("a"), at("b"), false);
    files->renameFile(at("b"), u"c");
    files->removeFile(at("c"));
    monitor->stop();
    messenger->deliverMessages();
    const std::string here = " " + root;
    const Changes own = {"1" + here, "2" + here, "1" + here, "1" + here + here, "2" + here};
    ASSERT_GE(listener.heard.size(), own.size());
    listener.heard.resize(own.size());
    EXPECT_EQ(listener.heard, own);
}

TEST_F(FNMonitorTest, EachNewFolderIsTold)
{
    EXPECT_TRUE(monitor->start());
    files->createDir(at("a/b/c", FPath::kFolder));
    files->createDir(at("a/b/c", FPath::kFolder));
    EXPECT_TRUE(monitor->registerPath(&listener, at("", FPath::kFolder)));
    messenger->deliverMessages();
    EXPECT_EQ(listener.heard, (Changes{"1 " + root, "1 " + root + "/a", "1 " + root + "/a/b"}));
}

TEST_F(FNMonitorTest, ExcludedPathsAreNotTold)
{
    EXPECT_TRUE(monitor->start());
    monitor->registerPath(&listener, at("", FPath::kFolder));
    FString pattern;
    FNMonitor::prepareExcludeFilter(at("a*b", FPath::kFolder), true, pattern);
    EXPECT_EQ(utf8(pattern), root + "/a\\*b/*");
    monitor->addExcludeFilter(pattern.text16());
    monitor->addExcludeFilter(pattern.text16());
    for (const auto& [name, type, excluded] : {std::tuple("a*b/x", 0, true), std::tuple("a*b", 1, true),
                                               std::tuple("a*bc/x", 0, false), std::tuple("aXb/x", 0, false)})
        EXPECT_EQ(monitor->isPathExcluded(*at(name, type)), excluded) << name;

    files->onFileSystemChange(FileSystemChange::kWritten, at("a*b/x"), nullptr);
    EXPECT_FALSE(messenger->areMessagesPosted(static_cast<CmObject*>(monitor), "PathChanged"));
    monitor->removeExcludeFilter(pattern.text16());
    EXPECT_FALSE(monitor->isPathExcluded(*at("a*b/x"))) << "a pattern that was added twice is there once";
}

TEST_F(FNMonitorTest, ExcludedFoldersStayUntoldByTheThread)
{
    std::filesystem::create_directory(root + "/quiet");
    std::filesystem::create_directory(root + "/loud");
    monitor->addExcludeFilter(FString((root + "/quiet").c_str()).text16());
    EXPECT_TRUE(monitor->registerPath(&listener, at("quiet")));
    EXPECT_TRUE(monitor->registerPath(&listener, at("loud")));
    ASSERT_TRUE(monitor->start()) << "what was registered before is watched";
    std::filesystem::create_directory(root + "/quiet/file");
    std::filesystem::create_directory(root + "/loud/file");
    EXPECT_EQ(nextChanges(), Changes{"3 " + root + "/loud"});
}

TEST_F(FNMonitorTest, FoldersBelowAreWatchedOnDemand)
{
    ASSERT_TRUE(monitor->start());
    std::filesystem::create_directories(root + "/a/b");
    EXPECT_FALSE(monitor->addPath(at("missing"), 0));
    EXPECT_TRUE(monitor->addPath(at("a"), FNMonitor::kRecursive));
    EXPECT_TRUE(monitor->registerPath(&listener, at("a")));
    std::filesystem::create_directory(root + "/a/b/file");
    EXPECT_EQ(nextChanges(), Changes{"3 " + root + "/a/b"});
    monitor->removePath(at("a"));
    std::filesystem::create_directory(root + "/a/b/other");
    std::filesystem::create_directory(root + "/a/file");
    EXPECT_EQ(nextChanges(), Changes{"3 " + root + "/a"}) << "the listener's own folder is still watched";
}

TEST_F(FNMonitorTest, ListenersMayLeaveWhenTheyAreTold)
{
    class Leaving : public Listener
    {
    public:
        void onFileSystemChanged(const FileSystemChange& change) override
        {
            Listener::onFileSystemChanged(change);
            FNMonitor::instance()->removeRegistry(other);
        }
        IFileSystemListener* other = nullptr;
    };
    EXPECT_TRUE(monitor->start());
    Leaving leaving;
    leaving.other = &listener;
    monitor->registerPath(&leaving, at(""));
    monitor->registerPath(&listener, at(""));
    files->onFileSystemChange(FileSystemChange::kWritten, at("a"), nullptr);
    messenger->deliverMessages();
    EXPECT_EQ(leaving.heard.size(), 1u);
    EXPECT_TRUE(listener.heard.empty());
    monitor->removeRegistry(&leaving);
}

TEST_F(FNMonitorTest, EndsWhileOtherThreadsTellOfChanges)
{
    std::atomic<bool> isOver{false};
    std::thread teller(
        [&]
        {
            const IPtr<FNPath> path = at("a");
            while (!isOver)
                files->onFileSystemChange(FileSystemChange::kWritten, path, nullptr);
        });
    for (int round = 0; round < 50; round++)
    {
        EXPECT_TRUE(monitor->start());
        termFNMonitor();
        EXPECT_FALSE(FNMonitor::existing());
        monitor = FNMonitor::instance();
        messenger->deliverMessages();
    }
    isOver = true;
    teller.join();
}

TEST_F(FNMonitorTest, MountEventsGoToSubscribers)
{
    MountListener mounts;
    files->subscribeToMountEvent(&mounts);
    files->subscribeToMountEvent(&mounts);
    FNPath volume(u"/media/user/stick", FPath::kFolder);
    files->onMountEvent("VolMount", &volume);
    files->onMountEvent("VolRename", &volume);
    files->unsubscribeFromMountEvent(&mounts);
    files->onMountEvent("VolUnmount", &volume);
    messenger->deliverMessages();
    EXPECT_EQ(mounts.heard, "VolMount /media/user/stick");
}
} // namespace
