#include "foundation/thread/fthread.h"
#include "resourcefixture.h"
#include "storage/filesystem/ffileiterator.h"
#include "storage/resource/farchiveprogress.h"
#include "storage/resource/resourcecheck.h"
#include "storage/stream/uprogresshook.h"
#include "storage/virtual/farchivemanager.h"
#include "storage/virtual/fvfilesystem.h"
#include "tests/storage/sizelimit.h"
#include "tools/qzr/command.h"

#include <thread>

// Whole folders in and out: what is left out, progress, threads, mounts, and the tool.

namespace
{
constexpr int kCompress = FResourceArchive::kCompressContent;

struct Progress : UProgressHook
{
    bool wasCanceled() override { return value >= cancelAt; }
    void setMaximum(int64 newMaximum) override { maximum = newMaximum; }
    void setValue(int64 newValue) override
    {
        isRising = isRising && newValue >= value;
        value = newValue;
    }
    int64 getValue() const override { return value; }
    void setText(const char16* text) override { texts += utf8(text) + " "; }

    int64 value = 0;
    int64 maximum = -1;
    int64 cancelAt = INT64_MAX;
    bool isRising = true;
    std::string texts;
};

TEST_F(ResourceTest, TellsHowFarItHasCome)
{
    Progress packing;
    ASSERT_TRUE(pack("a.qzr", 0, &packing));
    EXPECT_EQ(packing.maximum, static_cast<int64>(longText().size() + 4));
    EXPECT_EQ(packing.value, packing.maximum);
    EXPECT_TRUE(packing.isRising);
    EXPECT_EQ(packing.texts, "one two b.txt zero \u00FCml\u00E4ut ");
    Progress compressing;
    ASSERT_TRUE(pack("b.qzr", kCompress, &compressing));
    EXPECT_TRUE(compressing.isRising) << "also where a file gets no smaller, and is copied again";
    EXPECT_EQ(compressing.value, packing.maximum);
    Progress extracting;
    EXPECT_TRUE(opened("a.qzr")->extractAll(*at("out", FPath::kFolder), &extracting));
    EXPECT_EQ(extracting.value, packing.maximum);
}

TEST(FArchiveProgress, KeepsGreatTotalsIn31Bits)
{
    Progress outer;
    FArchiveProgress progress(&outer, 50000000000);
    EXPECT_EQ(outer.getValueCompression(), 100);
    EXPECT_EQ(outer.maximum, 500000000);
    progress.nextFile(u"one")->setValue(30000000000);
    progress.nextFile(u"two")->setValue(20000000000);
    EXPECT_EQ(outer.value, outer.maximum);
}

TEST_F(ResourceTest, ACancelledPackingLeavesNoFile)
{
    for (const int flags : {0, kCompress})
    {
        Progress progress;
        progress.cancelAt = 3;
        EXPECT_FALSE(pack("a.qzr", flags, &progress));
        EXPECT_FALSE(exists("a.qzr"));
    }
    EXPECT_FALSE(adopt(new FResourceArchive(at("a.qzr"), 0))->create(at("no folder"), 0, nullptr));
    EXPECT_FALSE(exists("a.qzr"));
}

TEST_F(ResourceTest, AFullDiskLosesNothing)
{
    std::string noise;
    for (uint32 state = 1; noise.size() < 200000; state = state * 1664525 + 1013904223)
        noise += static_cast<char>(state >> 24);
    put("src/noise", noise);
    ASSERT_TRUE(pack("a.qzr", kCompress));
    const std::string before = contentOf("a.qzr");
    const IPtr<FResourceArchive> archive = opened("a.qzr");
    put("out", "kept");
    FPath noisy(u"noise", FPath::kFile);
    // The last ones fail in the table and the ending alone.
    for (const std::size_t limit :
         {std::size_t{100}, std::size_t{100000}, before.size() - 100, before.size() - 1})
    {
        const SizeLimit full(limit);
        EXPECT_FALSE(pack("b.qzr", kCompress)) << limit;
        EXPECT_FALSE(archive->compact(kCompress, nullptr, nullptr)) << limit;
    }
    {
        const SizeLimit full(100);
        EXPECT_FALSE(archive->extractFile(archive->lookupNode(&noisy), *at("out"), nullptr));
    }
    EXPECT_EQ(contentOf("out"), "kept");
    EXPECT_EQ(contentOf("a.qzr"), before);
    EXPECT_EQ(read(*archive, u"noise"), noise) << "open as before";
    EXPECT_FALSE(exists("b.qzr") || exists("a-01.qzr") || exists("extracted"));
}

TEST_F(ResourceTest, LeavesOutWhatIsNoPlainFile)
{
    std::filesystem::create_symlink("b.txt", root + "/src/link");
    std::filesystem::create_symlink("..", root + "/src/up");
    std::filesystem::create_symlink("nowhere", root + "/src/broken");
    put("src/back\\slash", "x");
    put("src/stray\xFF", "x");
    const IPtr<FResourceArchive> archive = adopt(new FResourceArchive(at("src/own.qzr"), 0));
    ASSERT_TRUE(archive->create(at("src", FPath::kFolder), 0, nullptr));
    EXPECT_EQ(archive->getLeftOut().getCount(), 4);
    ASSERT_TRUE(archive->open());
    EXPECT_EQ(listing(*archive), "/b/ /b/one /b/two /b.txt /empty/ /link /zero /\u00FCml\u00E4ut ");
    EXPECT_EQ(read(*archive, u"link"), longText());
}

TEST_F(ResourceTest, TakesSeveralFoldersAndSingleFiles)
{
    std::filesystem::create_directories(root + "/more");
    put("more/a", "aa");
    put("more/zz", "zz");
    const IPtr<FResourceArchive> archive = adopt(new FResourceArchive(at("a.qzr"), 0));
    ASSERT_TRUE(archive->create(0, nullptr));
    auto& top = static_cast<FResourceEntry&>(*archive->getRoot());
    FArchiveProgress progress(nullptr, 0);
    EXPECT_TRUE(archive->addFolder(at("src", FPath::kFolder), top, progress));
    EXPECT_TRUE(archive->addFolder(at("more", FPath::kFolder), top, progress));
    ASSERT_TRUE(archive->close() && archive->open());
    EXPECT_EQ(listing(*archive), "/a /b/ /b/one /b/two /b.txt /empty/ /zero /zz /\u00FCml\u00E4ut ");
    EXPECT_EQ(read(*archive, u"zz") + read(*archive, u"b/two"), "zz22");
}

TEST_F(ResourceTest, ServesSeveralThreads)
{
    ASSERT_TRUE(pack("a.qzr", kCompress));
    const IPtr<FResourceArchive> archive =
        opened("a.qzr", FFileArchive::kOwnHandles | FFileArchive::kBuffered);
    std::vector<std::thread> threads;
    std::atomic<int> right{0};
    for (int i = 0; i < 4; i++)
        threads.emplace_back(
            [&]
            {
                for (int turn = 0; turn < 20; turn++)
                    if (read(*archive, u"b.txt") == longText() && read(*archive, u"b/two") == "22")
                        right++;
            });
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(right, 80);
    EXPECT_FALSE(archive->hasOpenStreams());
}

TEST_F(ResourceTest, AFolderAndItsFileOpenToTheSameBytes)
{
    initFResourceArchive();
    ASSERT_TRUE(pack("skin.qzr", kCompress));
    std::filesystem::copy_file(root + "/skin.qzr", root + "/skin");
    FArchiveManager* manager = FArchiveManager::instance();
    const IPtr<FVFileSystem> folder = adopt(new FVFileSystem(at("src", FPath::kFolder), false));
    const IPtr<FVFileSystem> file = adopt(new FVFileSystem(at("skin.qzr"), false));
    ASSERT_TRUE(folder->verify() && file->verify());
    EXPECT_TRUE(adopt(new FVFileSystem(at("skin"), false))->verify()) << "known by its first bytes";
    manager->registerArchive(folder, u"folder", u"folder");
    manager->registerArchive(file, u"file", u"file");

    FPath top(u"/", FPath::kFolder);
    const IPtr<FFileIterator> walk = adopt(folder->newIterator(&top, true));
    int count = 0;
    for (walk->first(); !walk->done(); walk->next())
    {
        const std::string path = fullPathOf(*walk->current());
        FNPath inFolder(FPath::kFile), inFile(FPath::kFile);
        inFolder.fromPlatformPath(("vfs://folder" + path).c_str());
        inFile.fromPlatformPath(("qzr://file" + path).c_str());
        EXPECT_EQ(files->fileExists(&inFolder), files->fileExists(&inFile)) << path;
        FStream* left = files->openFile(&inFolder, kFileRead, nullptr);
        FStream* right = files->openFile(&inFile, kFileRead, nullptr);
        ASSERT_EQ(left == nullptr, right == nullptr) << path;
        if (!left)
            continue;
        EXPECT_TRUE(left->isStreamEqual(*right)) << path;
        EXPECT_EQ(files->getFileSize(&inFolder), files->getFileSize(&inFile));
        files->closeFile(left);
        files->closeFile(right);
        count++;
    }
    EXPECT_EQ(count, 5);
    FNPath packed(u"qzr://file/b.txt", FPath::kFile);
    EXPECT_TRUE(files->copyFile(&packed, at("copied"), nullptr, nullptr));
    EXPECT_EQ(contentOf("copied"), longText());
    EXPECT_FALSE(manager->isBitwiseCopyable(&packed));
    FArchiveManager::terminate();
}

TEST_F(ResourceTest, ManyFilesComeBack)
{
    for (int folder = 0; folder < 20; folder++)
    {
        const std::string name = "src/" + std::to_string(folder);
        std::filesystem::create_directories(root + "/" + name);
        for (int file = 0; file < 50; file++)
            put(name + "/" + std::to_string(file), std::string(static_cast<std::size_t>(file * folder), 'a'));
    }
    ASSERT_TRUE(pack("a.qzr", kCompress));
    ASSERT_TRUE(opened("a.qzr")->extractAll(*at("out", FPath::kFolder), nullptr));
    const std::string difference = "diff -r '" + root + "/src' '" + root + "/out'";
    EXPECT_EQ(std::system(difference.c_str()), 0);
}

class QzrTool : public ResourceTest
{
protected:
    void TearDown() override
    {
        gFileSystem = files;
        FComponentRegistry::bringUp();
        ResourceTest::TearDown();
    }
    /// Runs the tool; its result, and what it said.
    int qzr(std::vector<std::string> arguments)
    {
        gComponentRegistry->release();
        gComponentRegistry = nullptr;
        std::vector<char*> pointers{const_cast<char*>("qzr")};
        for (std::string& argument : arguments)
            pointers.push_back(argument.data());
        testing::internal::CaptureStdout();
        testing::internal::CaptureStderr();
        const int result = runQzr(static_cast<int>(pointers.size()), pointers.data());
        said = testing::internal::GetCapturedStdout();
        complaint = testing::internal::GetCapturedStderr();
        gFileSystem = files;
        FComponentRegistry::bringUp();
        return result;
    }

    std::string said;
    std::string complaint;
};

TEST_F(QzrTool, PacksListsVerifiesAndExtracts)
{
    const std::string src = root + "/src", file = root + "/a.qzr", again = root + "/b.qzr",
                      out = root + "/out";
    EXPECT_EQ(qzr({"pack", "--compress=1", src, file}), 0) << complaint;
    EXPECT_EQ(qzr({"pack", "--compress=1", src, again}), 0);
    EXPECT_EQ(contentOf("a.qzr"), contentOf("b.qzr"));
    EXPECT_EQ(qzr({"list", file}), 0);
    EXPECT_NE(said.find("           2            2 /b/two\n"), std::string::npos) << said;
    EXPECT_EQ(qzr({"verify", file}), 0);
    EXPECT_EQ(said, "5 files, " + std::to_string(longText().size() + 4) + " bytes, 0 problems\n");
    EXPECT_EQ(qzr({"extract", file, out}), 0);
    EXPECT_EQ(contentOf("out/b.txt"), longText());
}

TEST_F(QzrTool, SaysWhatIsWrong)
{
    const std::string src = root + "/src", file = root + "/a.qzr";
    EXPECT_EQ(qzr({}), 2);
    EXPECT_EQ(qzr({"pack", src}), 2);
    EXPECT_EQ(qzr({"pack", "--compress=2", src, file}), 2);
    EXPECT_EQ(qzr({"pack", "--compress=", src, file}), 2);
    EXPECT_EQ(qzr({"pack", root + "/none", file}), 1);
    EXPECT_NE(complaint.find("there is no such folder"), std::string::npos);
    EXPECT_EQ(qzr({"pack", src, src + "/b/a.qzr"}), 1);
    EXPECT_NE(complaint.find("must not lie in the folder"), std::string::npos);
    EXPECT_EQ(qzr({"list", file}), 1);
    EXPECT_NE(complaint.find("there is no such file"), std::string::npos);
    put("a.qzr", "something else");
    EXPECT_EQ(qzr({"verify", file}), 1);
    EXPECT_EQ(contentOf("a.qzr"), "something else");

    ForgedFile forged;
    forged.file(u"..\u001B", "x");
    forged.file(u"..", "x");
    put("a.qzr", forged.bytes());
    EXPECT_EQ(qzr({"verify", file}), 1);
    EXPECT_NE(complaint.find("/..: a name that no folder can hold"), std::string::npos) << complaint;
    EXPECT_EQ(qzr({"list", file}), 0);
    EXPECT_NE(said.find("/..\\x1b\n"), std::string::npos) << "nothing steers the terminal";
    EXPECT_EQ(qzr({"extract", file, root + "/out"}), 1);
    EXPECT_NE(complaint.find("/..: not extracted"), std::string::npos) << complaint;
}
} // namespace
