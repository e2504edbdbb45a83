#include "services/defaults/fdefaultpool.h"
#include "services/presets/ffilepresetlist.h"
#include "services/presets/fpresetlistownfile.h"
#include "services/presets/fpresetpool.h"
#include "storage/attribute/fnewarchive.h"
#include "tests/services/presets/presetsupport.h"

namespace
{
class Pool : public FileTest
{
protected:
    void SetUp() override
    {
        FileTest::SetUp();
        folders.app.fromUTF8((root + "/app").c_str());
        std::filesystem::create_directory(root + "/app");
    }

    void TearDown() override
    {
        end();
        FileTest::TearDown();
    }

    static void end()
    {
        if (gPresetPool)
            gPresetPool->release();
        gPresetPool = nullptr;
    }

    /// The program ends and starts anew; gives what it has then.
    static std::string restart()
    {
        PreDefSaveFPresetPool();
        return start();
    }

    static std::string start()
    {
        end();
        PostDefLoadFPresetPool();
        std::string text;
        for (int i = 0; i < gPresetPool->countLists(); i++)
        {
            FPresetList& list = *gPresetPool->getListAt(i);
            text += std::string(list.isA()) + " " + utf8(list.getID()) + ": " + presetsOf(list) + "\n";
        }
        return text;
    }

    template <class List>
    static void addList(const char16* id, int number)
    {
        auto list = adopt(new List(id));
        list->addPreset(node(number), u"p");
        EXPECT_TRUE(gPresetPool->addPresetList(list));
        EXPECT_FALSE(gPresetPool->addPresetList(list)) << "there already";
    }

    void makeShippedPresets()
    {
        FNPath folder = *at("app/Presets", FPath::kFolder);
        auto pool = adopt(new FPresetPool);
        auto list = adopt(new FPresetList(u"shipped"));
        list->addPreset(node(5), u"five");
        pool->addPresetList(list);
        ASSERT_TRUE(pool->save(folder));
    }
};

const char* const kMemoryFile = "config/user/Presets/RAMPresets.xml";
} // namespace

TEST_F(Pool, IsEmptyWhereThereIsNoFile)
{
    static int calls = 0;
    FPresetPool::addPostLoadFunc([] { calls += gPresetPool ? 1 : 0; });
    EXPECT_EQ(start(), "");
    EXPECT_EQ(calls, 1);
    EXPECT_EQ(restart(), "");
    EXPECT_FALSE(exists("config/user/Presets")) << "nothing is made for nothing";
}

TEST_F(Pool, KeepsListsOfEachKindInTheirPlace)
{
    start();
    addList<FPresetList>(u"memory", 1);
    addList<FPresetListOwnFile>(u"own/file", 2);
    addList<FPresetListOwnFile>(u"RAMPresets", 3);
    EXPECT_EQ(restart(), "FPresetList memory: p=1\nFPresetListOwnFile RAMPresets: p=3\n"
                         "FPresetListOwnFile own/file: p=2\n");
    EXPECT_TRUE(exists("config/user/Presets/own_file.xml"));
    EXPECT_EQ(rightsOf(kMemoryFile), 0600);
    EXPECT_EQ(contentOf(kMemoryFile).find("own"), std::string::npos);
    EXPECT_NE(contentOf(kMemoryFile).find("<root name=\"Pool\" ID="), std::string::npos);
    EXPECT_NE(contentOf("config/user/Presets/own_file.xml").find("<root name=\"PresetList\" ID="),
              std::string::npos);

    FFilePresetList folder(*at("config/user/Presets/Folder", FPath::kFolder));
    folder.addPreset(node(4), u"four");
    EXPECT_EQ(restart(), "FPresetList memory: p=1\nFFilePresetList Folder: four=4\n"
                         "FPresetListOwnFile RAMPresets: p=3\nFPresetListOwnFile own/file: p=2\n");
    auto* opened = FCast(FFilePresetList, gPresetPool->getPresetList(u"Folder"));
    EXPECT_TRUE(gPresetPool->removeFilePreset(opened));
    EXPECT_TRUE(gPresetPool->removePresetList(gPresetPool->getPresetList(u"own/file")));
    EXPECT_TRUE(gPresetPool->removePresetList(gPresetPool->getPresetList(u"memory")));
    EXPECT_FALSE(gPresetPool->removePresetList(nullptr));
    EXPECT_EQ(gPresetPool->getPresetList(u"memory"), nullptr);
    EXPECT_EQ(restart(), "FFilePresetList Folder: four=4\nFPresetListOwnFile RAMPresets: p=3\n");
}

TEST_F(Pool, BeginsWithACopyOfWhatComesWithTheProgram)
{
    makeShippedPresets();
    EXPECT_EQ(start(), "FPresetList shipped: five=5\n");
    EXPECT_EQ(rightsOf(kMemoryFile), 0600);
    gPresetPool->removeAll();
    EXPECT_EQ(restart(), "") << "what the user removed doesn't come back";
}

TEST_F(Pool, PutsADamagedFileAsideAndTakesTheShippedOne)
{
    makeShippedPresets();
    std::filesystem::create_directories(root + "/config/user/Presets");
    const std::string whole = contentOf("app/Presets/RAMPresets.xml");
    put(kMemoryFile, whole.substr(0, whole.size() / 2));
    put("config/user/Presets/other.xml", "<no presets>");
    EXPECT_EQ(start(), "FPresetList shipped: five=5\n");
    addList<FPresetListOwnFile>(u"other", 2);
    EXPECT_EQ(restart(), "FPresetList shipped: five=5\nFPresetListOwnFile other: p=2\n");
    EXPECT_EQ(contentOf(std::string(kMemoryFile) + ".damaged"), whole.substr(0, whole.size() / 2));
    EXPECT_EQ(contentOf("config/user/Presets/other.xml"), "<no presets>");
    EXPECT_TRUE(exists("config/user/Presets/other-01.xml"));
}

TEST_F(Pool, ReadsTheOlderFileLast)
{
    auto older = adopt(new FPresetPool);
    auto list = adopt(new FPresetList(u"older"));
    list->addPreset(node(3), u"three");
    list->addSubList(u"below")->addPreset(node(4), u"four", false);
    older->addPresetList(list);
    auto stream = adopt(new FMemoryStream);
    {
        FNewArchive archive(stream, true);
        ASSERT_TRUE(older->externalize(archive));
    }
    const std::string whole = ::contentOf(*stream);
    for (size_t i = 0; i < whole.size(); i++)
    {
        put("app/Presets2.bin", whole.substr(0, i));
        ASSERT_EQ(start(), "") << "cut at " << i;
    }
    put("app/Presets2.bin", whole);
    EXPECT_EQ(start(), "FPresetList older: three=3 below(four=4)\n");
    std::filesystem::remove(root + "/app/Presets2.bin");
    EXPECT_EQ(restart(), "FPresetList older: three=3 below(four=4)\n") << "it is converted";
    EXPECT_FALSE(gPresetPool->getListAt(0)->getSubList(0)->canModifiyPreset(0));
}

TEST_F(Pool, AFailedWriteLeavesTheEarlierFile)
{
    start();
    addList<FPresetList>(u"memory", 1);
    PreDefSaveFPresetPool();
    const std::string whole = contentOf(kMemoryFile);
    FCast(StoredNode, gPresetPool->getListAt(0)->getPresetObject(0))->refusesToStore = true;
    EXPECT_FALSE(gPresetPool->save(*at("config/user/Presets", FPath::kFolder)));
    EXPECT_EQ(contentOf(kMemoryFile), whole);
    EXPECT_FALSE(exists("config/user/Presets/Presets.tmp"));
}
