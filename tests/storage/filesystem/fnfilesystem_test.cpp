#include "storage/filesystem/fnfilesystem.h"

#include "containers/sequence/cmarray.h"
#include "containers/value/cmdate.h"
#include "containers/value/cmtime.h"
#include "storage/filesystem/ffileiterator.h"
#include "storage/filesystem/fnfilesystemscanner.h"
#include "storage/stream/ffilestream.h"
#include "storage/stream/uprogresshook.h"
#include "tests/storage/filefixture.h"

#include <cerrno>
#include <ctime>
#include <sys/stat.h>
#include <unistd.h>

namespace
{
class NamedCancel : public UProgressHook
{
public:
    bool wasCanceled() override { return value > 100000; }
    void setMaximum(int64) override {}
    void setValue(int64 newValue) override { value = newValue; }
    int64 getValue() const override { return value; }
    void setText(const char16*) override {}

    int64 value = 0;
};

using FNFileSystemTest = FileTest;

// Opening

TEST_F(FNFileSystemTest, CreatingMakesFoldersAndTruncatesUnlessDirect)
{
    EXPECT_TRUE(write(at("x/y/z.txt"), "0123456789"));
    EXPECT_EQ(contentOf("x/y/z.txt"), "0123456789");
    EXPECT_TRUE(write(at("x/y/z.txt"), "ab", kFileWrite | kFileDirect));
    EXPECT_EQ(contentOf("x/y/z.txt"), "ab23456789") << "direct access keeps the old content";
    EXPECT_TRUE(write(at("x/y/z.txt"), "ab"));
    EXPECT_EQ(contentOf("x/y/z.txt"), "ab");
}

TEST_F(FNFileSystemTest, OpeningTellsWhyItFails)
{
    int error = 0;
    EXPECT_EQ(files->openFile(at("missing"), kFileRead, &error), nullptr);
    EXPECT_EQ(error, ENOENT);
    std::filesystem::create_directory(root + "/folder");
    EXPECT_EQ(files->openFile(at("folder"), kFileRead, &error), nullptr);
    EXPECT_EQ(error, EISDIR) << "a folder that the path takes for a file";
    EXPECT_EQ(files->openFile(at("folder", FPath::kFolder), kFileRead, &error), nullptr);
    put("file", "x");
    EXPECT_EQ(files->createFile(at("file/below"), kFileWrite, &error), nullptr);
    EXPECT_EQ(error, ENOTDIR);
    EXPECT_EQ(files->createFile(at(std::string(256, 'n')), kFileWrite, &error), nullptr);
    EXPECT_EQ(FNFileSystem::fromPlatformErrorCode(error), FNFileSystem::kNameTooLong);
    EXPECT_EQ(files->openFile(nullptr, kFileRead, &error), nullptr);
}

TEST_F(FNFileSystemTest, PipesWithoutAWriterDontBlock)
{
    ASSERT_EQ(mkfifo((root + "/pipe").c_str(), 0600), 0);
    FStream* stream = files->openFile(at("pipe"), kFileRead, nullptr);
    ASSERT_NE(stream, nullptr);
    char byte = 0;
    EXPECT_EQ(stream->readRaw(&byte, 1), 0);
    files->closeFile(stream);
    at("pipe")->detectFileType(true);
}

TEST_F(FNFileSystemTest, StreamsKnowPathAndType)
{
    const IPtr<FNPath> path = at("a.txt");
    FFileStream* stream = FCast(FFileStream, files->createFile(path, kFileWrite, nullptr));
    path->ascend();
    EXPECT_EQ(fullPathOf(*stream->getPath()), root + "/a.txt") << "the stream has a path of its own";
    EXPECT_EQ(utf8(stream->getFileType().getName()), "Text File");
    files->closeFile(stream);
}

// What is for the owner only

TEST_F(FNFileSystemTest, UserFolderIsForItsOwnerOnly)
{
    const mode_t former = umask(0);
    EXPECT_TRUE(write(at("config/user/deep/token"), "secret"));
    EXPECT_TRUE(write(at("config/other"), "x"));
    put("config/user/old", "leaked");
    EXPECT_TRUE(write(at("config/user/old"), "secret"));
    umask(former);
    EXPECT_EQ(rightsOf("config/user"), 0700);
    EXPECT_EQ(rightsOf("config/user/deep"), 0700);
    EXPECT_EQ(rightsOf("config/user/deep/token"), 0600);
    EXPECT_EQ(rightsOf("config/user/old"), 0600) << "a file that others could read is closed to them";
    EXPECT_EQ(rightsOf("config"), 0777);
    EXPECT_EQ(rightsOf("config/other"), 0666);

    put("open", "x");
    std::filesystem::permissions(root + "/open", std::filesystem::perms(0644));
    EXPECT_TRUE(files->copyFile(at("open"), at("config/user/copied"), nullptr, nullptr));
    EXPECT_EQ(rightsOf("config/user/copied"), 0600);
}

// Names on disk

TEST_F(FNFileSystemTest, FindsNamesInOtherForms)
{
    // On disk: a decomposed folder with a decomposed file, and a sign that composes to another one.
    std::filesystem::create_directory(root + "/o\xCC\x88");
    put("o\xCC\x88/a\xCC\x88.txt", "found");
    put("\xE2\x84\xAB", "angstrom");
    const IPtr<FNPath> path = at("\xC3\xB6/\xC3\xA4.txt");
    EXPECT_TRUE(files->fileExists(path));
    EXPECT_EQ(files->getFileSize(path), 5);
    EXPECT_TRUE(files->fileExists(at("\xC3\x85")));
    EXPECT_FALSE(files->fileExists(at("\xC3\xB6/\xC3\xA5.txt")));

    EXPECT_TRUE(write(path, "written"));
    EXPECT_EQ(contentOf("o\xCC\x88/a\xCC\x88.txt"), "written") << "no second file beside it";
    EXPECT_TRUE(write(at("\xC3\xB6/new\xC3\xBC"), "x"));
    EXPECT_TRUE(exists("o\xCC\x88/new\xC3\xBC")) << "new names are composed, in the folder that is there";
    EXPECT_FALSE(exists("\xC3\xB6"));
    EXPECT_TRUE(files->removeFile(path));
    EXPECT_FALSE(exists("o\xCC\x88/a\xCC\x88.txt"));
}

TEST_F(FNFileSystemTest, ComposedNameComesFirst)
{
    put("\xC3\xA4", "composed");
    put("a\xCC\x88", "decomposed");
    EXPECT_EQ(files->getFileSize(at("a\xCC\x88")), 8);
}

TEST_F(FNFileSystemTest, OddNamesAreNamesLikeOthers)
{
    for (const std::string& name :
         {std::string("q\"uo'te"), std::string("line\nfeed"), std::string("\xE4\xFF\x80"),
          std::string(255, 'n'), std::string(" blank ")})
    {
        EXPECT_TRUE(write(at(name), name));
        EXPECT_EQ(contentOf(name), name);
        EXPECT_TRUE(files->renameFile(at(name), u"renamed"));
        EXPECT_TRUE(files->renameFile(at("renamed"), at(name)->getName().text16()));
        EXPECT_TRUE(files->removeFile(at(name)));
        EXPECT_FALSE(exists(name));
    }
    std::string deep = "d";
    for (int i = 0; i < 30; i++)
        deep += "/" + std::string(100, 'd');
    EXPECT_TRUE(write(at(deep + "/file"), "x"))
        << "paths may be longer than the text that others get of them";
    EXPECT_TRUE(files->removeDir(at("d", FPath::kFolder), true));
}

// Changes

TEST_F(FNFileSystemTest, RenamingKeepsTheNameOnFailure)
{
    const IPtr<FNPath> path = at("a");
    EXPECT_FALSE(files->renameFile(path, u"b"));
    EXPECT_EQ(fullPathOf(*path), root + "/a");
    put("a", "x");
    EXPECT_TRUE(files->renameFile(path, u"b"));
    EXPECT_EQ(fullPathOf(*path), root + "/b");
    EXPECT_TRUE(files->fileExists(path));
}

TEST_F(FNFileSystemTest, MovingUpdatesTheSourceOnDemand)
{
    put("a", "x");
    const IPtr<FNPath> from = at("a");
    EXPECT_FALSE(files->moveFile(at("missing"), at("b"), true));
    EXPECT_TRUE(files->moveFile(from, at("b"), true));
    EXPECT_EQ(fullPathOf(*from), root + "/b");
    EXPECT_TRUE(files->moveFile(from, at("c"), false));
    EXPECT_EQ(fullPathOf(*from), root + "/b");
    EXPECT_EQ(contentOf("c"), "x");
}

TEST_F(FNFileSystemTest, MovingAcrossDevicesLeavesNothingBehind)
{
    const std::string elsewhere = "/dev/shm/files-test-" + std::to_string(getpid());
    struct stat here = {}, there = {};
    if (stat(root.c_str(), &here) != 0 || stat("/dev/shm", &there) != 0 || here.st_dev == there.st_dev ||
        access("/dev/shm", W_OK) != 0)
        GTEST_SKIP() << "no second device at hand";
    put("a", "content");
    std::filesystem::permissions(root + "/a", std::filesystem::perms(0640));
    FNPath target;
    target.fromPlatformPath(elsewhere.c_str());
    EXPECT_TRUE(files->moveFile(at("a"), &target, false));
    EXPECT_FALSE(exists("a"));
    EXPECT_EQ(std::filesystem::status(elsewhere).permissions(), std::filesystem::perms(0640));
    EXPECT_TRUE(files->moveFile(&target, at("back"), false));
    EXPECT_FALSE(std::filesystem::exists(elsewhere));
    EXPECT_EQ(contentOf("back"), "content");
}

TEST_F(FNFileSystemTest, Copying)
{
    put("a", std::string(200000, 'x'));
    std::filesystem::create_directory(root + "/folder");
    EXPECT_TRUE(files->copyFile(at("a"), at("folder", FPath::kFolder), nullptr, nullptr));
    EXPECT_EQ(contentOf("folder/a"), contentOf("a"));
    EXPECT_FALSE(files->copyFile(at("a"), at("none", FPath::kFolder), nullptr, nullptr));
    EXPECT_FALSE(files->copyFile(at("a"), at("folder"), nullptr, nullptr)) << "over a folder";
    EXPECT_FALSE(files->copyFile(at("folder", FPath::kFolder), at("b"), nullptr, nullptr));
    EXPECT_FALSE(files->copyFile(at("missing"), at("b"), nullptr, nullptr));

    std::filesystem::create_symlink("a", root + "/link");
    EXPECT_FALSE(files->copyFile(at("a"), at("link"), nullptr, nullptr));
    EXPECT_EQ(contentOf("a").size(), 200000u) << "a copy onto itself would empty it";

    NamedCancel hook;
    EXPECT_FALSE(files->copyFile(at("a"), at("canceled"), &hook, nullptr));
    EXPECT_GT(hook.value, 0);
    EXPECT_FALSE(exists("canceled"));
}

TEST_F(FNFileSystemTest, FoldersComeAndGo)
{
    EXPECT_TRUE(files->createDir(at("a/b/c", FPath::kFolder)));
    EXPECT_TRUE(files->createDir(at("a/b/c", FPath::kFolder)));
    EXPECT_TRUE(files->dirExists(at("a/b/c")));
    EXPECT_FALSE(files->fileExists(at("a/b/c")));
    EXPECT_FALSE(files->removeDir(at("a", FPath::kFolder), false));

    EXPECT_TRUE(files->isFolderEmpty(at("a"))) << "folders alone don't fill one";
    put("a/b/file", "x");
    EXPECT_FALSE(files->isFolderEmpty(at("a")));
    files->createDir(at("a/d/e", FPath::kFolder));
    EXPECT_TRUE(files->removeEmptyFolders(at("a")));
    EXPECT_FALSE(exists("a/d"));
    EXPECT_FALSE(exists("a/b/c"));
    EXPECT_TRUE(exists("a/b/file"));

    put("outside", "kept");
    std::filesystem::create_directory(root + "/kept");
    put("kept/file", "kept");
    std::filesystem::create_symlink(root + "/kept", root + "/a/link");
    EXPECT_TRUE(files->removeDir(at("a", FPath::kFolder), true));
    EXPECT_FALSE(exists("a"));
    EXPECT_EQ(contentOf("kept/file"), "kept") << "what a link leads to stays";
    EXPECT_FALSE(files->removeDir(at("outside"), true));
    EXPECT_FALSE(files->removeDir(at("missing"), true));
}

TEST_F(FNFileSystemTest, CopiesFoldersWithAndWithoutFiles)
{
    write(at("a/b/file"), "x");
    files->createDir(at("a/c", FPath::kFolder));
    EXPECT_TRUE(files->copyFolderStructure(at("a"), at("structure")));
    EXPECT_TRUE(exists("structure/b") && exists("structure/c"));
    EXPECT_FALSE(exists("structure/b/file"));
    EXPECT_TRUE(files->copyFolderAndFileStructure(at("a"), at("all"), nullptr));
    EXPECT_EQ(contentOf("all/b/file"), "x");
    EXPECT_FALSE(files->copyFolderAndFileStructure(at("a"), at("a/inside"), nullptr))
        << "never ends otherwise";

    FNPath found;
    EXPECT_TRUE(files->findFile(at("a"), u"file", true, found));
    EXPECT_EQ(fullPathOf(found), root + "/a/b/file");
    EXPECT_FALSE(files->findFile(at("a"), u"file", false, found));
}

// Questions

TEST_F(FNFileSystemTest, TimesAndSizes)
{
    put("a", "12345");
    CmTime created(0u), modified(0u);
    ASSERT_TRUE(files->getFileTimes(at("a"), created, modified));
    const time_t now = time(nullptr);
    tm parts = {};
    gmtime_r(&now, &parts);
    const CmDate today(static_cast<unsigned>(parts.tm_mday), static_cast<unsigned>(parts.tm_mon + 1),
                       static_cast<unsigned>(parts.tm_year + 1900));
    const CmTime expected(today, static_cast<unsigned>(parts.tm_hour), static_cast<unsigned>(parts.tm_min),
                          static_cast<unsigned>(parts.tm_sec), false);
    EXPECT_LE(expected.getSeconds() - modified.getSeconds(), 600u);
    EXPECT_LE(expected.getSeconds() - created.getSeconds(), 600u);
    EXPECT_FALSE(files->getFileTimes(at("missing"), created, modified));

    EXPECT_EQ(files->getFileSize(at("a")), 5);
    EXPECT_EQ(at("a")->getSize(), 5);
    EXPECT_EQ(files->getFileSize(at("missing")), -1);
    EXPECT_EQ(at("missing")->getSize(), 0);
    FStream* stream = files->openFile(at("a"), kFileRead, nullptr);
    EXPECT_EQ(files->getFileSize(stream), 5);
    files->closeFile(stream);
}

TEST_F(FNFileSystemTest, SizesInWords)
{
    struct Row
    {
        size_t size;
        int unit;
        const char* text;
    };
    const Row rows[] = {
        {1500, FNFileSystem::kBytes, "1.500 Bytes"},
        {1500, -1, "1.465 KB"},
        {500, -1, "0.500 Bytes"},
        {3 << 20, -1, "3.000 MB"},
        {1536, FNFileSystem::kMegaBytes, "0.001 MB"},
        {3 << 20, FNFileSystem::kKiloBytes, "3072.000 KB"},
    };
    for (const Row& row : rows)
    {
        put("a", std::string(row.size, 'x'));
        FString text;
        EXPECT_TRUE(files->getFileSizeString(at("a"), text, row.unit));
        EXPECT_EQ(utf8(text), row.text);
    }
    put("a", "");
    FString text;
    EXPECT_FALSE(files->getFileSizeString(at("a"), text, -1));
}

TEST_F(FNFileSystemTest, ErrorsInNumbersAndWords)
{
    struct Row
    {
        int error;
        int code;
        const char* text;
    };
    const Row rows[] = {
        {0, 0, "No error occurred."},
        {EIO, -2001, "A reading/writing error occurred. This disk is not working normaly."},
        {ENOENT, -2002, "The file/folder could not be found at this location."},
        {ENAMETOOLONG, -2003, "This name is too long."},
        {63, -2003, "This name is too long."},
        {ENOSPC, -2004, "This disk is full."},
        {EROFS, -2005, "This disk is read only."},
        {EPERM, -2006, "This operation is not allowed."},
        {EACCES, -2006, "This operation is not allowed."},
        {-38, -2000, "A reading/writing error occurred. This disk is not working normaly."},
        {-36, -2000, "A reading/writing error occurred. This disk is not working normaly."},
        {-43, -2000, "The file/folder could not be found at this location."},
        {-35, -2000, "The file/folder could not be found at this location."},
        {-34, -2000, "This disk is full."},
        {-33, -2000, "This disk is full."},
        {-44, -2000, "This disk is read only."},
        {-61, -2000, "This operation is not allowed."},
        {-54, -2000, "This operation is not allowed."},
        {-46, -2000, "This operation is not allowed."},
        {-45, -2000, "This operation is not allowed."},
        {-60, -2000, "An unexpected error occurred. The system's description is: Unknown error -60"},
        {EBUSY, -2000, "An unexpected error occurred. The system's description is: Device or resource busy"},
    };
    for (const Row& row : rows)
    {
        EXPECT_EQ(FNFileSystem::fromPlatformErrorCode(row.error), row.code) << row.error;
        FString text;
        FNFileSystem::getErrorMessage(row.error, text);
        EXPECT_EQ(utf8(text), row.text);
    }
}

TEST_F(FNFileSystemTest, NamesAreMadeValid)
{
    FString name(u" a/b*c? ");
    EXPECT_TRUE(files->makeValidName(name, 0, true));
    EXPECT_EQ(utf8(name), "a_b_c_");
    EXPECT_FALSE(files->makeValidName(name, u'-', true));
    name = FString(std::u16string(2000, u'x').c_str());
    EXPECT_TRUE(files->makeValidName(name, 0, false));
    EXPECT_EQ(name.length(), 1024u);
    FString path(u"/a*b?");
    EXPECT_TRUE(FNFileSystem::makeValidPath(path, 0));
    EXPECT_EQ(utf8(path), "/axbS");

    name = FString(std::u16string(100, u'\u65E5').append(u".wav").c_str());
    EXPECT_TRUE(files->makeValidFileName(name, 0, false));
    EXPECT_LE(utf8(name).size(), 255u);
    EXPECT_TRUE(utf8(name).ends_with("\xE6\x97\xA5.wav"));
    for (const char16* text : {u"..", u".", u""})
    {
        name = FString(text);
        EXPECT_TRUE(files->makeValidFileName(name, 0, false));
        EXPECT_EQ(utf8(name), "_" + utf8(text));
    }
}

TEST_F(FNFileSystemTest, OpenModesInTwoSpellings)
{
    using Direction = FNFileSystem::ModeDirection;
    EXPECT_EQ(FNFileSystem::convertOpenMode(kFileReadWrite | kFileShare, Direction::kToPlain),
              uint32{kFileRead | kFileWrite | kFileShare});
    EXPECT_EQ(FNFileSystem::convertOpenMode(kFileRead | kFileWrite | kFileShare, Direction::kFromPlain),
              uint32{kFileReadWrite | kFileShare});
    for (const auto direction : {Direction::kToPlain, Direction::kFromPlain})
        EXPECT_EQ(FNFileSystem::convertOpenMode(kFileRead | kFileShare, direction),
                  uint32{kFileRead | kFileShare});
}

TEST_F(FNFileSystemTest, RightsLinksAndVolumes)
{
    put("a", "x");
    EXPECT_TRUE(files->enableWrite(at("a"), false));
    EXPECT_EQ(rightsOf("a") & 0200, 0);
    EXPECT_TRUE(files->enableWrite(at("a"), true));
    EXPECT_TRUE(files->canWrite(at("a")));
    EXPECT_FALSE(files->canWrite(at("missing")));
    EXPECT_TRUE(files->isHidden(at(".a")));
    EXPECT_FALSE(files->isHidden(at("a")));

    FNPath relative(u"a", FPath::kFile);
    EXPECT_TRUE(files->createSymlink(at("link"), &relative));
    EXPECT_TRUE(files->isSymlink(at("link")));
    EXPECT_FALSE(files->isSymlink(at("a")));
    FNPath target;
    EXPECT_TRUE(files->readSymlink(at("link"), target));
    EXPECT_EQ(fullPathOf(target), "a");
    EXPECT_FALSE(files->readSymlink(at("a"), target));
    const IPtr<FNPath> link = at("link");
    EXPECT_TRUE(files->checkResolveLink(link));
    EXPECT_EQ(fullPathOf(*link), std::filesystem::canonical(root).string() + "/a");
    EXPECT_TRUE(files->createLink(at("hard"), at("a")));
    EXPECT_EQ(std::filesystem::hard_link_count(root + "/a"), 2u);
    std::filesystem::remove(root + "/a");
    EXPECT_FALSE(files->checkResolveLink(at("link")));

    uint64 available = 0, total = 0;
    EXPECT_TRUE(files->getFreeBytesOnDisk(at(""), available, &total));
    EXPECT_GT(total, 0u);
    EXPECT_LE(available, total);
    CmArray drives;
    drives.takeElements();
    const int count = files->getDrives(drives, 2 + 4 + 8 + 32);
    ASSERT_GT(count, 0);
    EXPECT_EQ(drives.total(), count);
    EXPECT_EQ(fullPathOf(*FCast(FNPath, drives.at(0))), "/");
    EXPECT_EQ(files->getDrives(drives, 64), 0);
    for (const auto& [type, words] : {std::pair(2, "Harddisk"), std::pair(4, "Removable Drive"),
                                      std::pair(8, "Compact Disc"), std::pair(32, "Network Drive")})
        EXPECT_EQ(utf8(files->getDriveTypeString(type)), words);
    EXPECT_EQ(files->getDriveTypeString(64), nullptr);
    EXPECT_EQ(fullPathOf(*files->getRootDir(at("x"))), "/");
}

TEST_F(FNFileSystemTest, ChangesTheFolderOfTheProcess)
{
    const std::filesystem::path former = std::filesystem::current_path();
    EXPECT_TRUE(files->changeDir(at("")));
    FNPath relative(u"made", FPath::kFile);
    EXPECT_TRUE(write(&relative, "x"));
    std::filesystem::current_path(former);
    EXPECT_EQ(contentOf("made"), "x");
    EXPECT_FALSE(files->changeDir(at("missing")));
    FString name;
    EXPECT_TRUE(files->getDirName(at("a/b"), name));
    EXPECT_EQ(utf8(name), root + "/a/");
}

// Walks

std::string walked(IFileIteratorImpl& walk)
{
    std::string names;
    for (walk.first(); !walk.done(); walk.next())
    {
        const IPtr<FPath> entry = walk.current();
        names += utf8(entry->getName()) + std::to_string(entry->getPathType()) + " ";
    }
    return names;
}

TEST_F(FNFileSystemTest, WalksFolders)
{
    write(at("a/file"), "12");
    write(at("a/b/deep"), "345");
    put(".hidden", "6");
    std::filesystem::create_directory(root + "/tool.app");
    std::filesystem::create_symlink(root, root + "/loop");
    const IPtr<FFileIterator> flat = adopt(files->newIterator(at(""), false));
    EXPECT_EQ(walked(*flat), ".hidden0 a1 loop2 tool.app1 ");
    EXPECT_EQ(walked(*flat), ".hidden0 a1 loop2 tool.app1 ") << "once more from the first";
    const IPtr<FFileIterator> deep = adopt(files->newIterator(at(""), true));
    EXPECT_EQ(walked(*deep), ".hidden0 a1 loop2 tool.app1 b1 file0 deep0 ");
    FNFileIterator visible(at("").get(), true);
    EXPECT_EQ(walked(visible), "a1 loop2 ");
    FNFileIterator missing(at("missing").get());
    EXPECT_EQ(walked(missing), "");
    EXPECT_EQ(missing.current(), nullptr);

    CmLinkedList bases;
    const IPtr<FNPath> a = at("a"), b = at("a/b");
    bases.add(b);
    bases.add(a);
    FNFileSystemScanner scanner(&bases);
    EXPECT_EQ(walked(scanner), "deep0 b1 file0 deep0 ");

    int64 bytes = 0;
    EXPECT_EQ(files->countFiles(at("a"), true, false, &bytes), 2);
    EXPECT_EQ(bytes, 5);
    EXPECT_EQ(files->countFiles(at("a"), true, true, nullptr), 3);
    EXPECT_EQ(files->countFiles(at("a"), false, false, &bytes), 1);
}
} // namespace
