#include "storage/virtual/ffilesystemadapter.h"

#include "foundation/object/fvariant.h"
#include "foundation/object/iattributes.h"
#include "foundation/object/istring.h"
#include "storage/filesystem/ffileiterator.h"
#include "storage/stream/fmemorystream.h"
#include "storage/url/furl.h"
#include "storage/virtual/farchivemanager.h"
#include "tests/storage/filefixture.h"

#include <map>

namespace
{
using Box = std::map<std::string, IPtr<FMemoryStream>>;

class BoxWalk : public FObject, public IVirtualFileIterator
{
    DECLARE_TYPE(BoxWalk, FObject)
    FORWARD_FUNKNOWN(FObject)

    explicit BoxWalk(const Box& walked) : box(walked), place(box.begin()) {}
    int32 queryInterface(const char* id, void** object) override
    {
        return FObject::queryInterface(id, object);
    }
    void first() override { place = box.begin(); }
    void next() override { ++place; }
    bool done() override { return place == box.end(); }
    int32 current(IString* path, bool* isFolder) override
    {
        path->setText8(place->first.c_str());
        *isFolder = false;
        return kResultOk;
    }

private:
    const Box& box;
    Box::const_iterator place;
};

/// A component that keeps files in memory.
class BoxFiles : public FObject, public IVirtualFileSystem
{
    DECLARE_TYPE(BoxFiles, FObject)
    FORWARD_FUNKNOWN(FObject)

    int32 queryInterface(const char* id, void** object) override
    {
        return FObject::queryInterface(id, object);
    }
    int32 getDescription(IAttributes* attributes) override
    {
        for (const char* ability : {"CanIterate", "CanRead", "CanWrite"})
            attributes->set(ability, FVariant(isAble ? 1 : 0));
        return kResultOk;
    }
    int32 createFile(const char16* path, int, IBStream** stream) override
    {
        box[utf8(path)] = adopt(new FMemoryStream);
        return openFile(path, 0, stream);
    }
    int32 openFile(const char16* path, int, IBStream** stream) override
    {
        if (box.count(utf8(path)) == 0)
            return 1;
        FMemoryStream* found = box[utf8(path)];
        found->rewind();
        found->addRef();
        *stream = found;
        return kResultOk;
    }
    int32 removeFile(const char16* path) override { return box.erase(utf8(path)) ? kResultOk : 1; }
    int32 fileExists(const char16* path) override { return box.count(utf8(path)) ? kResultOk : 1; }
    int32 renameFile(const char16* path, const char16* newName) override
    {
        return moveFile(path, (std::u16string(u"/") + newName).c_str());
    }
    int32 moveFile(const char16* from, const char16* to) override
    {
        box[utf8(to)] = box[utf8(from)];
        return removeFile(from);
    }
    int32 createFolder(const char16*) override { return 1; }
    int32 removeFolder(const char16*, bool) override { return 1; }
    int32 getFileSize(const char16* path, int64* size) override
    {
        if (fileExists(path) != kResultOk)
            return 1;
        *size = box[utf8(path)]->getSize();
        return kResultOk;
    }
    int32 newIterator(const char16*, bool, IVirtualFileIterator** walk) override
    {
        *walk = new BoxWalk(box);
        return kResultOk;
    }
    int32 unmount() override
    {
        unmounts++;
        return isStubborn ? 1 : kResultOk;
    }

    Box box;
    bool isAble = true;
    bool isStubborn = false;
    int unmounts = 0;
};

/// A stream of a component that notes whether its file system can be unmounted while it ends.
class LastStream : public FMemoryStream
{
    DECLARE_TYPE(LastStream, FMemoryStream)

    LastStream(FFileSystemAdapter* itsFiles, bool& result) : files(itsFiles), wasUnmounted(result) {}
    ~LastStream() override { wasUnmounted = files->unmount(); }

private:
    FFileSystemAdapter* files;
    bool& wasUnmounted;
};

class AdapterTest : public FileTest
{
protected:
    void TearDown() override
    {
        FArchiveManager::terminate();
        FileTest::TearDown();
    }

    IPtr<BoxFiles> plugin = adopt(new BoxFiles);
};

TEST_F(AdapterTest, FilesOfAComponentAreFilesLikeOthers)
{
    const IPtr<FFileSystemAdapter> adapter = adopt(new FFileSystemAdapter(plugin));
    FPath path(u"/a b", FPath::kFile), other(u"/c", FPath::kFile);
    FStream* stream = adapter->createFile(&path, kFileWrite, nullptr);
    ASSERT_NE(stream, nullptr);
    EXPECT_EQ(stream->writeRaw("content", 7), 7);
    EXPECT_TRUE(adapter->closeFile(stream));
    EXPECT_TRUE(adapter->fileExists(&path));
    EXPECT_EQ(adapter->getFileSize(&path), 7);

    stream = adapter->openFile(&path, kFileRead, nullptr);
    char content[20] = {};
    EXPECT_EQ(stream->seek(3, kSeekStart), 3);
    EXPECT_EQ(stream->readRaw(content, 19), 4);
    EXPECT_STREQ(content, "tent");
    EXPECT_EQ(stream->tell(), 7);
    EXPECT_EQ(stream->readRaw(content, 1), 0);
    adapter->closeFile(stream);

    EXPECT_TRUE(adapter->copyFile(&path, &other, nullptr, nullptr));
    EXPECT_EQ(adapter->getFileSize(&other), 7);
    EXPECT_TRUE(adapter->renameFile(&other, u"d"));
    EXPECT_EQ(fullPathOf(other), "/d");
    EXPECT_TRUE(adapter->moveFile(&other, &path, true));
    EXPECT_TRUE(adapter->removeFile(&path));
    EXPECT_FALSE(adapter->fileExists(&path));
    EXPECT_EQ(adapter->openFile(&path, kFileRead, nullptr), nullptr);
}

TEST_F(AdapterTest, WhatAComponentCannotDoIsNotAskedOfIt)
{
    plugin->box["/a"] = adopt(new FMemoryStream);
    plugin->isAble = false;
    const IPtr<FFileSystemAdapter> adapter = adopt(new FFileSystemAdapter(plugin));
    FPath path(u"/a", FPath::kFile);
    EXPECT_EQ(adapter->openFile(&path, kFileRead, nullptr), nullptr);
    EXPECT_EQ(adapter->createFile(&path, kFileWrite, nullptr), nullptr);
    EXPECT_EQ(adapter->newIterator(&path, false), nullptr);
    EXPECT_FALSE(adapter->removeFile(&path));
    EXPECT_FALSE(adapter->renameFile(&path, u"b"));
    EXPECT_EQ(plugin->box.size(), 1u);
}

TEST_F(AdapterTest, PathsOfUrlsAreDecoded)
{
    FString text;
    const FUrl url(u"tonerack://box/a%20b.wav");
    EXPECT_TRUE(FFileSystemAdapter::getPathFromUrl(&url, text));
    EXPECT_EQ(utf8(text), "tonerack://box/a b.wav");
    const FPath path(u"/a%20b", FPath::kFile);
    EXPECT_TRUE(FFileSystemAdapter::getPathFromUrl(&path, text));
    EXPECT_EQ(utf8(text), "/a%20b");
    EXPECT_FALSE(FFileSystemAdapter::getPathFromUrl(nullptr, text));

    plugin->box["/x y"] = adopt(new FMemoryStream);
    const IPtr<FFileSystemAdapter> adapter = adopt(new FFileSystemAdapter(plugin));
    const IPtr<FFileIterator> urls = adopt(adapter->newIterator(&url, false));
    const IPtr<FFileIterator> paths = adopt(adapter->newIterator(&path, false));
    EXPECT_EQ(fullPathOf(*urls->current()), "tonerack://box/x%20y");
    EXPECT_EQ(fullPathOf(*paths->current()), "/x y");
    paths->next();
    EXPECT_TRUE(paths->done());
    FFileSystemAdapter::makeFileSizeString(1500, text);
    EXPECT_EQ(utf8(text), "1.465 KB");
}

TEST_F(AdapterTest, StaysMountedWhileAStreamIsOpen)
{
    plugin->box["/a"] = adopt(new FMemoryStream);
    FArchiveManager* manager = FArchiveManager::instance();
    IPtr<FFileSystemAdapter> adapter = adopt(new FFileSystemAdapter(plugin));
    manager->registerArchive(adapter, u"box", u"box");
    FNPath path(u"tonerack://box/a", FPath::kFile);
    FStream* stream = files->openFile(&path, kFileRead, nullptr);
    ASSERT_NE(stream, nullptr);
    manager->unmountUnusedVirtualFileSystems();
    EXPECT_TRUE(manager->containsArchive(u"box"));
    EXPECT_EQ(plugin->unmounts, 0);
    manager->registerArchive(adapter, u"alias", u"alias");
    manager->unregisterArchive(adapter);

    adapter = nullptr;
    files->closeFile(stream);
    manager->unmountUnusedVirtualFileSystems();
    EXPECT_FALSE(manager->containsArchive(u"box"));
    EXPECT_EQ(plugin->unmounts, 1);
    EXPECT_EQ(plugin->getRefCount(), 1u);
}

TEST_F(AdapterTest, AStreamEndsBeforeItsFileSystemMayGo)
{
    const IPtr<FFileSystemAdapter> adapter = adopt(new FFileSystemAdapter(plugin));
    bool wasUnmounted = true;
    plugin->box["/a"] = adopt(new LastStream(adapter, wasUnmounted));
    FPath path(u"/a", FPath::kFile);
    FStream* stream = adapter->openFile(&path, kFileRead, nullptr);
    plugin->box.clear();
    stream->release();
    EXPECT_FALSE(wasUnmounted);
    EXPECT_TRUE(adapter->unmount());
}

TEST_F(AdapterTest, AnUnmountedOneOpensNothing)
{
    plugin->box["/a"] = adopt(new FMemoryStream);
    const IPtr<FFileSystemAdapter> adapter = adopt(new FFileSystemAdapter(plugin));
    plugin->isStubborn = true;
    EXPECT_FALSE(adapter->unmount());
    plugin->isStubborn = false;
    FPath stays(u"/a", FPath::kFile);
    EXPECT_TRUE(adapter->fileExists(&stays)) << "mounted still";
    EXPECT_TRUE(adapter->unmount());
    FPath path(u"/a", FPath::kFile);
    EXPECT_EQ(adapter->openFile(&path, kFileRead, nullptr), nullptr);
    EXPECT_FALSE(adapter->fileExists(&path));
}
} // namespace
