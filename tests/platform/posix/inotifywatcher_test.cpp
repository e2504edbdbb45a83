#include "storage/filesystem/ifilewatcher.h"

#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>
#include <string>

namespace
{
using Happening = IFileWatcher::Happening;

class FileWatcherTest : public testing::Test
{
protected:
    void SetUp() override
    {
        std::string pattern = (std::filesystem::temp_directory_path() / "watch-XXXXXX").string();
        root = mkdtemp(pattern.data());
        watcher = IFileWatcher::make();
        ASSERT_TRUE(watcher);
    }
    void TearDown() override { std::filesystem::remove_all(root); }

    Happening next() { return watcher->wait(2000, number); }

    std::string root;
    std::unique_ptr<IFileWatcher> watcher;
    int number = -1;
};

TEST_F(FileWatcherTest, TellsWhichFolderChanged)
{
    std::filesystem::create_directory(root + "/a");
    std::filesystem::create_directory(root + "/b");
    const int a = watcher->add((root + "/a").c_str());
    const int b = watcher->add((root + "/b").c_str());
    EXPECT_EQ(watcher->add((root + "/b").c_str()), b);
    EXPECT_EQ(watcher->add((root + "/missing").c_str()), -1);
    std::filesystem::create_directory(root + "/b/c");
    EXPECT_EQ(next(), Happening::kChanged);
    EXPECT_EQ(number, b);
    std::filesystem::rename(root + "/a", root + "/moved");
    EXPECT_EQ(next(), Happening::kRemoved);
    EXPECT_EQ(number, a);
    std::ofstream(root + "/moved/file") << "x";
    EXPECT_EQ(watcher->wait(50, number), Happening::kTimeout) << "a folder that was moved is watched no more";
}

TEST_F(FileWatcherTest, RemovedFoldersAndWaking)
{
    const int folder = watcher->add(root.c_str());
    std::filesystem::remove_all(root);
    while (next() != Happening::kRemoved)
    {
    }
    EXPECT_EQ(number, folder);
    EXPECT_EQ(watcher->wait(0, number), Happening::kTimeout);
    watcher->wake();
    EXPECT_EQ(watcher->wait(-1, number), Happening::kWoken);
    EXPECT_EQ(watcher->wait(-1, number), Happening::kWoken) << "once awake, always awake";
}
} // namespace
