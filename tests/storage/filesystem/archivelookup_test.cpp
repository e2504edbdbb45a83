#include "storage/filesystem/iarchivelookup.h"

#include "storage/stream/fmemorystream.h"
#include "tests/storage/filefixture.h"

namespace
{
/// A mounted archive that notes what it is asked.
class MountedArchive : public FFileSystem
{
public:
    CmObject* newCopy() const override { return nullptr; }
    FStream* openFile(FPath* path, int flags, int*) override
    {
        note("open", *path, std::to_string(flags));
        return new FMemoryStream;
    }
    bool fileExists(FPath* path) override
    {
        note("exists", *path, "");
        return true;
    }
    bool copyFile(FPath* from, FPath* to, UProgressHook*, int*) override
    {
        note("copy", *from, fullPathOf(*to));
        return true;
    }

    std::string told() { return std::move(notes); }

private:
    void note(const char* what, const FPath& path, const std::string& more)
    {
        notes = std::string(what) + " " + fullPathOf(path) + " " + more;
    }

    std::string notes;
};

/// All that is below a name ending in ".zip" is inside the archive.
class Mounts : public IArchiveLookup
{
public:
    bool isArchivePath(const FPath* path) override { return beginOf(*path) != std::string::npos; }
    FFileSystem* getFileSystem(const FPath* path) override
    {
        if (!isArchivePath(path))
            return nullptr;
        archive->addRef();
        return archive.get();
    }
    FPath* getPath(const FPath& path) override
    {
        return new FPath(FString(fullPathOf(path).substr(beginOf(path) + 4).c_str()).text16(), FPath::kFile);
    }

    IPtr<MountedArchive> archive = adopt(new MountedArchive);

private:
    static std::size_t beginOf(const FPath& path) { return fullPathOf(path).find(".zip/"); }
};

class ArchiveLookupTest : public FileTest
{
protected:
    void SetUp() override
    {
        FileTest::SetUp();
        IArchiveLookup::setInstance(&mounts);
    }
    void TearDown() override
    {
        IArchiveLookup::setInstance(nullptr);
        FileTest::TearDown();
    }

    Mounts mounts;
};

TEST_F(ArchiveLookupTest, PathsIntoArchivesAreHandedOn)
{
    const IPtr<FNPath> inside = at("a.zip/in"), outside = at("out");
    FStream* stream = files->openFile(inside, kFileReadWrite, nullptr);
    EXPECT_EQ(mounts.archive->told(), "open /in 5") << "to be read and shared, whatever was asked for";
    EXPECT_TRUE(files->closeFile(stream));
    EXPECT_EQ(files->openFile(inside, kFileRead | kFileDirect, nullptr), nullptr);
    EXPECT_EQ(mounts.archive->told(), "") << "direct access is that of a disk";
    EXPECT_TRUE(files->fileExists(inside));
    EXPECT_EQ(mounts.archive->told(), "exists /in ");
    EXPECT_TRUE(files->copyFile(inside, outside, nullptr, nullptr));
    EXPECT_EQ(mounts.archive->told(), "copy " + root + "/a.zip/in " + root + "/out");
    EXPECT_TRUE(files->copyFile(outside, inside, nullptr, nullptr));
    EXPECT_EQ(mounts.archive->told(), "copy " + root + "/out " + root + "/a.zip/in");
    EXPECT_EQ(files->getDriveType(inside), FNFileSystem::kArchiveDrive);

    EXPECT_FALSE(files->fileExists(outside));
    EXPECT_NE(files->getDriveType(outside), FNFileSystem::kArchiveDrive);
    EXPECT_EQ(mounts.archive->told(), "");
}
} // namespace
