#include "storage/virtual/fvfilesystem.h"

#include "containers/value/cmtime.h"
#include "storage/filesystem/ffileiterator.h"
#include "storage/url/furl.h"
#include "storage/virtual/farchivemanager.h"
#include "storage/virtual/innerpath.h"
#include "tests/storage/filefixture.h"

#include <set>

namespace
{
class VirtualFilesTest : public FileTest
{
protected:
    void SetUp() override
    {
        FileTest::SetUp();
        std::filesystem::create_directories(root + "/skin/images");
        put("skin/skin.xml", "<skin/>");
        put("skin/images/a.png", "png");
        put("secret", "secret");
    }
    void TearDown() override
    {
        FArchiveManager::terminate();
        FileTest::TearDown();
    }

    IPtr<FVFileSystem> mount(bool writable) const
    {
        return adopt(new FVFileSystem(at("skin", FPath::kFolder), writable));
    }

    static std::string read(FFileSystem& from, const char16* text)
    {
        FPath path(text, FPath::kFile);
        FStream* stream = from.openFile(&path, kFileRead | kFileShare, nullptr);
        if (!stream)
            return "null";
        char content[20] = {};
        stream->readRaw(content, 19);
        from.closeFile(stream);
        return content;
    }
};

FPath inner(const char16* text, int type = FPath::kFile)
{
    return FPath(text, type);
}

TEST_F(VirtualFilesTest, PathsBeginWhereItIsMounted)
{
    const IPtr<FVFileSystem> skin = mount(false);
    EXPECT_TRUE(skin->verify());
    for (const char16* text : {u"images/a.png", u"/images/a.png", u"./images//b/../a.png", u"images\\a.png"})
        EXPECT_EQ(read(*skin, text), "png") << utf8(text);
    EXPECT_EQ(read(*skin, u"skin.xml"), "<skin/>");
    FPath image = inner(u"/images/a.png");
    EXPECT_TRUE(skin->fileExists(&image));
    EXPECT_EQ(skin->getFileSize(&image), 3);
    CmTime created, modified;
    EXPECT_TRUE(skin->getFileTimes(&image, created, modified));
    FString folder;
    EXPECT_TRUE(skin->getDirName(&image, folder));
    EXPECT_EQ(utf8(folder), "/images");
    EXPECT_TRUE(skin->isBitwiseCopyable(&image));
}

TEST_F(VirtualFilesTest, PathsLeadNowhereElse)
{
    const IPtr<FVFileSystem> skin = mount(true);
    for (const char16* text :
         {u"../secret", u"/../secret", u"images/../../secret", u"..\\secret", u"..\\..\\x/y"})
    {
        EXPECT_EQ(read(*skin, text), "null") << utf8(text);
        FPath path = inner(text);
        EXPECT_EQ(skin->createFile(&path, kFileWrite, nullptr), nullptr);
        EXPECT_EQ(skin->translatePath(&path), nullptr);
        EXPECT_FALSE(skin->removeFile(&path));
    }
    EXPECT_EQ(contentOf("secret"), "secret");
}

TEST_F(VirtualFilesTest, TranslatesThereAndBack)
{
    const IPtr<FVFileSystem> skin = mount(false);
    FPath image = inner(u"/images/a.png");
    const IPtr<FPath> native = skin->translatePath(&image);
    EXPECT_EQ(fullPathOf(*native), root + "/skin/images/a.png");
    EXPECT_EQ(fullPathOf(*skin->reverseTranslate(native)), "/images/a.png");
    EXPECT_EQ(skin->reverseTranslate(at("secret")), nullptr);
    EXPECT_EQ(skin->reverseTranslate(at("skins/x")), nullptr) << "a sibling with a longer name";

    std::set<std::string> found;
    FPath top = inner(u"/", FPath::kFolder);
    const IPtr<FFileIterator> walk = adopt(skin->newIterator(&top, true));
    for (walk->first(); !walk->done(); walk->next())
        found.insert(fullPathOf(*walk->current()) + (walk->current()->isFolder() ? "/" : ""));
    EXPECT_EQ(found, (std::set<std::string>{"/skin.xml", "/images/", "/images/a.png"}));
    int64 bytes = 0;
    EXPECT_EQ(skin->countFiles(&top, true, false, &bytes), 2);
    EXPECT_EQ(bytes, 10);
}

TEST_F(VirtualFilesTest, ChangesNothingUnlessAllowed)
{
    const IPtr<FVFileSystem> skin = mount(false);
    FPath xml = inner(u"/skin.xml"), fresh = inner(u"/new"), folder = inner(u"/images", FPath::kFolder);
    EXPECT_EQ(skin->createFile(&fresh, kFileWrite, nullptr), nullptr);
    EXPECT_EQ(skin->openFile(&xml, kFileReadWrite, nullptr), nullptr);
    EXPECT_FALSE(skin->removeFile(&xml));
    EXPECT_FALSE(skin->renameFile(&xml, u"other"));
    EXPECT_FALSE(skin->moveFile(&xml, &fresh, false));
    EXPECT_FALSE(skin->copyFile(&xml, &fresh, nullptr, nullptr));
    EXPECT_FALSE(skin->createDir(&fresh));
    EXPECT_FALSE(skin->removeDir(&folder, true));
    EXPECT_TRUE(exists("skin/skin.xml") && exists("skin/images/a.png") && !exists("skin/new"));

    skin->enableWrite(true);
    EXPECT_TRUE(skin->copyFile(&xml, &fresh, nullptr, nullptr));
    EXPECT_EQ(contentOf("skin/new"), "<skin/>");
    EXPECT_TRUE(skin->renameFile(&fresh, u"newer"));
    EXPECT_EQ(fullPathOf(fresh), "/newer");
    FPath deep = inner(u"/x/y/z");
    FStream* stream = skin->createFile(&deep, kFileWrite, nullptr);
    ASSERT_NE(stream, nullptr);
    EXPECT_TRUE(skin->closeFile(stream));
    EXPECT_TRUE(skin->moveFile(&fresh, &deep, true));
    EXPECT_EQ(fullPathOf(fresh), "/x/y/z");
    EXPECT_EQ(contentOf("skin/x/y/z"), "<skin/>");
    EXPECT_TRUE(skin->removeFile(&deep));
    EXPECT_TRUE(skin->removeDir(&folder, true));
    EXPECT_FALSE(exists("skin/images"));
}

TEST_F(VirtualFilesTest, WhatCannotBeMountedShows)
{
    EXPECT_FALSE(adopt(new FVFileSystem(at("missing", FPath::kFolder), false))->verify());
    FPath plain(FString((root + "/missing").c_str()).text16(), FPath::kFolder);
    EXPECT_FALSE(adopt(new FVFileSystem(&plain, false))->verify());
    const IPtr<FVFileSystem> noMount = adopt(new FVFileSystem(at("secret"), false));
    EXPECT_FALSE(noMount->verify());
    EXPECT_EQ(read(*noMount, u"a"), "null");
    EXPECT_EQ(noMount->getFileSize(static_cast<FStream*>(nullptr)), -1);
}

TEST_F(VirtualFilesTest, TheTypeOfAFileSaysHowItIsMounted)
{
    static FFileType boxes("x-test/box", "box", "box", 0, "Box");
    FFileType::registerType(&boxes);
    FVFileSystem::registerHandler(&boxes,
                                  [](FPath* path) -> FFileSystem*
                                  { return path->getName().isEmpty() ? nullptr : new FNFileSystem; });
    put("a.box", "");
    const IPtr<FVFileSystem> mounted = adopt(new FVFileSystem(at("a.box"), false));
    EXPECT_TRUE(mounted->verify());
    EXPECT_NE(mounted->getTarget(), gFileSystem);
    EXPECT_EQ(read(*mounted, FString((root + "/secret").c_str()).text16()), "secret")
        << "all of the target is mounted";
    FFileType::unregisterType(&boxes);
}

TEST_F(VirtualFilesTest, IsFoundByNameAndCopiesInAndOut)
{
    const IPtr<FVFileSystem> skin = mount(true);
    FArchiveManager::instance()->registerArchive(skin, u"skin", u"skin");
    FNPath image(u"vfs://skin/images/a.png", FPath::kFile), fresh(u"vfs://skin/new/b", FPath::kFile);
    EXPECT_TRUE(files->copyFile(&image, at("out"), nullptr, nullptr));
    EXPECT_EQ(contentOf("out"), "png");
    EXPECT_TRUE(files->copyFile(&image, at("", FPath::kFolder), nullptr, nullptr));
    EXPECT_EQ(contentOf("a.png"), "png");
    EXPECT_TRUE(files->copyFile(at("secret"), &fresh, nullptr, nullptr));
    EXPECT_EQ(contentOf("skin/new/b"), "secret");
    EXPECT_FALSE(files->copyFile(&image, at("skin/images/a.png"), nullptr, nullptr)) << "both are one file";
    EXPECT_FALSE(files->copyFile(at("skin/images/a.png"), &image, nullptr, nullptr));
    EXPECT_FALSE(files->copyFile(&image, &image, nullptr, nullptr));
    EXPECT_EQ(contentOf("skin/images/a.png"), "png");
    skin->enableWrite(false);
    EXPECT_FALSE(files->copyFile(at("out"), &fresh, nullptr, nullptr));
    EXPECT_EQ(contentOf("skin/new/b"), "secret");

    FNPath folder(u"vfs://skin/images", FPath::kFolder);
    const IPtr<FVFileSystem> images = adopt(new FVFileSystem(&folder, false));
    EXPECT_EQ(read(*images, u"a.png"), "png") << "a folder of a mounted one";
    EXPECT_EQ(read(*images, u"../skin.xml"), "null");
}
} // namespace
