#include "containers/sequence/cmarray.h"
#include "services/defaults/fdefaultpool.h"
#include "storage/filesystem/fsys.h"
#include "tests/storage/filefixture.h"

namespace
{
class FNPathDefaults : public FileTest
{
protected:
    void SetUp() override
    {
        FileTest::SetUp();
        gDefaultPool = pool;
        types.add(&wave);
    }
    void TearDown() override
    {
        gDefaultPool = nullptr;
        FileTest::TearDown();
    }

    IPtr<FDefaultPool> pool = adopt(new FDefaultPool);
    FFileType wave{nullptr, "wav", "wav", 0, "Wave"};
    CmArray types;
};

TEST_F(FNPathDefaults, PathsAreKeptUnderTheirKey)
{
    FNPath path(u"/a/b.wav", FPath::kLink);
    EXPECT_TRUE(path.storeAsDefault("key"));
    FNPath restored(FPath::kFolder);
    EXPECT_FALSE(restored.fromDefault("other"));
    EXPECT_TRUE(restored.isFolder());
    EXPECT_TRUE(restored.fromDefault("key"));
    EXPECT_EQ(fullPathOf(restored), "/a/b.wav");
    EXPECT_TRUE(restored.isFile());
    String text;
    EXPECT_TRUE(pool->getTString("Default Paths", "key", text));
    EXPECT_EQ(utf8(text), "/a/b.wav");

    gDefaultPool = nullptr;
    EXPECT_FALSE(path.storeAsDefault("key"));
    EXPECT_FALSE(path.fromDefault("key"));
}

TEST_F(FNPathDefaults, LastPathSurvives)
{
    EXPECT_FALSE(files->storeLastPath());
    EXPECT_FALSE(files->loadLastPath());
    files->setLastPath(at("folder", FPath::kFolder));
    EXPECT_TRUE(files->storeLastPath());
    files->setLastPath(nullptr);
    EXPECT_TRUE(files->loadLastPath());
    EXPECT_EQ(fullPathOf(*files->getLastPath()), root + "/folder");
    EXPECT_TRUE(files->getLastPath()->isFolder());
}

TEST_F(FNPathDefaults, DialogsBeginWhereTheLastOneOfTheirTypeEnded)
{
    const auto initPath = [](CmContainer* wanted)
    {
        FNPath* folder = nullptr;
        FString name(u"a/b");
        const bool isFound = FSys::getInitPath(folder, name, wanted, 1);
        EXPECT_EQ(isFound, folder != nullptr);
        EXPECT_EQ(utf8(name), wanted ? "a_b.wav" : "a_b");
        const IPtr<FNPath> holder = adopt(folder);
        return folder ? fullPathOf(*folder) : std::string();
    };
    EXPECT_EQ(initPath(&types), "");
    const IPtr<FNPath> waves = at("waves", FPath::kFolder), others = at("others", FPath::kFolder);
    files->createDir(waves);
    files->createDir(others);
    FSys::storeInitPath(*waves, &types);
    FSys::storeInitPath(*others, nullptr);
    String text;
    EXPECT_TRUE(pool->getTString("Default Paths", "Default Path for \"Wave\" Files", text));
    EXPECT_EQ(initPath(&types), root + "/waves");
    EXPECT_EQ(initPath(nullptr), root + "/others");
    files->removeDir(waves, false);
    EXPECT_EQ(initPath(&types), root + "/others") << "a folder that is gone";
}
} // namespace
