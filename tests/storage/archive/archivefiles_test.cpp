#include "foundation/text/iuseralert.h"
#include "storage/archive/fxmlarchive.h"
#include "storage/attribute/fnewarchive.h"
#include "storage/stream/ffiletype.h"
#include "tests/storage/filefixture.h"
#include "tests/storage/objectfixture.h"

namespace
{
const char* const kFile = "config/user/name.xml";
const char* const kTwin = "config/user/name_old.xml";
const char* const kUnfinished = "config/user/name.xml.new";
const char* const kBackup = "config/user/name.xml.backup";

class ArchiveFiles : public FileTest
{
protected:
    void SetUp() override
    {
        FileTest::SetUp();
        folders.app.fromUTF8((root + "/app").c_str());
        std::filesystem::create_directory(root + "/app");
    }

    static bool save(int number, CmObject* object = nullptr)
    {
        FAttributes tree;
        tree.set("n", number);
        tree.setObject("object", object);
        return FXmlArchive::saveAttributes(u"name", "root", tree);
    }
    /// -1 where nothing can be loaded.
    static int load()
    {
        FAttributes tree;
        return FXmlArchive::loadAttributes(u"name", "root", tree) ? static_cast<int>(tree.getInt("n")) : -1;
    }
};

/// Looks at the folder while it is saved.
class Spy : public CmObject
{
    DECLARE_TYPE(Spy, CmObject)

    explicit Spy(std::string folder) : root(std::move(folder)) {}

    bool storeAttributes(FAttributes& attributes) const override
    {
        sawTwin = std::filesystem::exists(root + "/" + kTwin);
        std::ifstream file(root + "/" + kFile, std::ios::binary);
        sawFile = std::string(std::istreambuf_iterator<char>(file), {});
        attributes.set("x", 1);
        return succeeds;
    }

    std::string root;
    bool succeeds = true;
    mutable bool sawTwin = false;
    mutable std::string sawFile;
};

class Answer : public IUserAlert
{
public:
    explicit Answer(int button) : answer(button) { set(this); }
    ~Answer() override { set(nullptr); }
    int run(const char16* text, int, const char16* button1, const char16* button2, const char16*) override
    {
        asked = utf8(ConstString(text)) + "|" + utf8(ConstString(button1)) + "|" + utf8(ConstString(button2));
        return answer;
    }

    int answer;
    std::string asked;
};
} // namespace

TEST_F(ArchiveFiles, ReplaceTheEarlierFileAndLeaveNoTwin)
{
    EXPECT_EQ(load(), -1);
    EXPECT_TRUE(save(1));
    EXPECT_EQ(
        contentOf(kFile),
        "<?xml version=\"1.0\" encoding=\"utf-8\"?>\r<root>\r   <int name=\"n\" value=\"1\"/>\r</root>\r");
    EXPECT_EQ(rightsOf(kFile), 0600) << "what is in the user folder may be secret";
    put(kTwin, "left by a crash");
    put(kUnfinished, "left by a crash too");
    const std::string before = contentOf(kFile);
    auto spy = adopt(new Spy(root));
    EXPECT_TRUE(save(2, spy));
    EXPECT_TRUE(spy->sawTwin);
    EXPECT_EQ(spy->sawFile, before) << "a crash while saving must not lose the earlier version";
    EXPECT_FALSE(exists(kTwin) || exists(kUnfinished));
    EXPECT_EQ(load(), 2);
}

TEST_F(ArchiveFiles, AFailedSaveLeavesTheEarlierFile)
{
    auto spy = adopt(new Spy(root));
    spy->succeeds = false;
    EXPECT_FALSE(save(1, spy));
    EXPECT_FALSE(exists(kFile)) << "no part of a file under the final name";
    EXPECT_TRUE(save(1));
    const std::string before = contentOf(kFile);
    EXPECT_FALSE(save(2, spy));
    EXPECT_EQ(contentOf(kFile), before);
    EXPECT_FALSE(exists(kTwin) || exists(kUnfinished));
}

TEST_F(ArchiveFiles, AFullDiskLeavesTheEarlierFile)
{
    EXPECT_TRUE(save(1));
    // Writes to this device fail as on a full disk, and not before the stream is flushed.
    FNPath* oldPath = nullptr;
    FStream* stream = FXmlArchive::createUserFile(u"name", false, oldPath);
    ASSERT_TRUE(stream && oldPath);
    files->closeFile(stream);
    std::filesystem::remove(root + "/" + kFile);
    std::filesystem::create_symlink("/dev/full", root + "/" + kFile);
    stream = files->openFile(at(kFile), kFileReadWrite, nullptr);
    ASSERT_TRUE(stream);
    FAttributes tree;
    tree.set("n", 2);
    const bool isWritten = FXmlArchive(stream, true).saveAttributes("root", tree);
    EXPECT_FALSE(files->closeFile(stream) && isWritten);
    FXmlArchive::finishXmlArchiveWrite(false, u"name", oldPath);
    EXPECT_EQ(load(), 1);
    EXPECT_FALSE(exists(kTwin));
}

TEST_F(ArchiveFiles, ADamagedFileCountsAsAbsentWhole)
{
    EXPECT_TRUE(save(1));
    const std::string whole = contentOf(kFile);
    put(kFile, whole.substr(0, whole.size() - 8));
    FAttributes tree;
    tree.set("before", 7);
    EXPECT_FALSE(FXmlArchive::loadAttributes(u"name", "root", tree));
    EXPECT_EQ(tree.total(), 1);
    StoredNode node(5);
    EXPECT_FALSE(FXmlArchive::restoreObject(u"name", "root", &node));
    EXPECT_EQ(node.number, 5);
    put(kFile, whole);
    EXPECT_FALSE(FXmlArchive::loadAttributes(u"name", "other", tree)) << "another root tag";
    EXPECT_TRUE(FXmlArchive::loadAttributes(u"name", "root", tree));
    EXPECT_EQ(tree.total(), 2);
}

TEST_F(ArchiveFiles, OneThatTheSystemRefusesIsToldFromAMissingAndADamagedOne)
{
    const auto isUnreadable = []
    {
        FAttributes tree;
        bool result = true;
        EXPECT_FALSE(FXmlArchive::loadAttributes(u"name", "root", tree, &result));
        return result;
    };
    EXPECT_FALSE(isUnreadable()) << "missing";
    ASSERT_TRUE(save(1));
    put(kFile, contentOf(kFile).substr(0, 70));
    EXPECT_FALSE(isUnreadable()) << "damaged";
    std::filesystem::remove(root + "/" + kFile);
    std::filesystem::create_symlink("/proc/self/mem", root + "/" + kFile);
    EXPECT_TRUE(isUnreadable()) << "opens, and can't be read";
    std::filesystem::remove(root + "/" + kFile);
    std::filesystem::create_directory(root + "/" + kFile);
    EXPECT_TRUE(isUnreadable()) << "can't be opened";
}

TEST_F(ArchiveFiles, ReadingPrefersTheUsersCopyToTheShippedOne)
{
    put("app/name.xml", "<root><int name='n' value='3'/></root>");
    EXPECT_EQ(load(), 3);
    EXPECT_TRUE(save(1));
    EXPECT_EQ(load(), 1);
    EXPECT_TRUE(FXmlArchive::removeObjectArchive(u"name"));
    EXPECT_EQ(load(), 3);
    EXPECT_FALSE(FXmlArchive::objectArchiveExists(u"name")) << "asks for the user's copy";
}

TEST_F(ArchiveFiles, ObjectsAreStoredAsRoots)
{
    StoredNode node(5, adopt(new StoredNode(6)));
    EXPECT_TRUE(FXmlArchive::storeObject(u"name", "root", &node, false));
    StoredNode restored;
    EXPECT_TRUE(FXmlArchive::restoreObject(u"name", "root", &restored));
    EXPECT_EQ(restored.number, 5);
    ASSERT_TRUE(restored.nextNode());
    EXPECT_EQ(restored.nextNode()->number, 6);
}

TEST_F(ArchiveFiles, TheUserMayKeepTheEarlierFile)
{
    StoredNode node(1);
    EXPECT_TRUE(FXmlArchive::storeObject(u"name", "root", &node, true))
        << "nothing to replace, so nobody is asked";
    const std::string before = contentOf(kFile);
    node.number = 2;
    EXPECT_FALSE(FXmlArchive::storeObject(u"name", "root", &node, true)) << "nobody to ask";
    {
        Answer cancel(2);
        EXPECT_FALSE(FXmlArchive::storeObject(u"name", "root", &node, true));
        EXPECT_EQ(cancel.asked, "Do you want to replace name?|Replace|Cancel");
    }
    EXPECT_EQ(contentOf(kFile), before);
    EXPECT_FALSE(exists(kTwin));
    Answer replace(1);
    EXPECT_TRUE(FXmlArchive::storeObject(u"name", "root", &node, true));
    EXPECT_NE(contentOf(kFile), before);
}

TEST_F(ArchiveFiles, BackupsAreMadeAndPutBack)
{
    EXPECT_FALSE(FXmlArchive::backupObjectArchive(u"name"));
    EXPECT_TRUE(save(1));
    EXPECT_FALSE(FXmlArchive::restoreObjectArchive(u"name")) << "no backup";
    EXPECT_EQ(load(), 1);
    EXPECT_TRUE(FXmlArchive::backupObjectArchive(u"name"));
    EXPECT_TRUE(exists(kBackup));
    EXPECT_TRUE(save(2));
    EXPECT_TRUE(FXmlArchive::restoreObjectArchive(u"name"));
    EXPECT_EQ(load(), 1);
    EXPECT_FALSE(exists(kBackup));
}

TEST_F(ArchiveFiles, AreRenamedWithTheirType)
{
    EXPECT_TRUE(save(1));
    EXPECT_TRUE(FXmlArchive::renameObjectArchive(u"name", u"other"));
    EXPECT_TRUE(exists("config/user/other.xml"));
    EXPECT_FALSE(FXmlArchive::objectArchiveExists(u"name"));
    EXPECT_TRUE(FXmlArchive::objectArchiveExists(u"other"));
    EXPECT_EQ(*FFileType::getTypeByString(u"xml"), FXmlArchive::fileTypeNormal());
}

TEST_F(ArchiveFiles, NamesKeepWhatStandsBehindADot)
{
    const StoredNode first(1), second(2);
    FAttributes tree;
    tree.set("n", 1);
    EXPECT_TRUE(FXmlArchive::saveAttributes(u"a.b", "root", tree));
    tree.set("n", 2);
    EXPECT_TRUE(FXmlArchive::saveAttributes(u"a.c", "root", tree));
    EXPECT_TRUE(exists("config/user/a.b.xml") && exists("config/user/a.c.xml"));
    EXPECT_TRUE(FXmlArchive::loadAttributes(u"a.b", "root", tree));
    EXPECT_EQ(tree.getInt("n"), 1) << "a file of its own";
    EXPECT_TRUE(FXmlArchive::saveAttributes(u"a.b", "root", tree));
    EXPECT_FALSE(exists("config/user/a.b_old.xml"));
    EXPECT_TRUE(FXmlArchive::backupObjectArchive(u"a.b"));
    EXPECT_TRUE(exists("config/user/a.b.xml.backup"));
    EXPECT_TRUE(FXmlArchive::renameObjectArchive(u"a.b", u"version 1.2"));
    EXPECT_TRUE(exists("config/user/version 1.2.xml"));
    EXPECT_FALSE(FXmlArchive::restoreObjectArchive(u"a.b")) << "there is nothing to remove";
    EXPECT_TRUE(exists("config/user/a.b.xml")) << "but the backup is put back";
    put("app/a.d.xml", "<root><int name='n' value='3'/></root>");
    EXPECT_TRUE(FXmlArchive::loadAttributes(u"a.d", "root", tree));
    EXPECT_TRUE(FNewArchive::storeObject(u"a.b", &first) && FNewArchive::storeObject(u"a.c", &second));
    StoredNode restored;
    EXPECT_TRUE(exists("config/user/a.b.bin") && FNewArchive::restoreObject(u"a.b", &restored));
    EXPECT_EQ(restored.number, 1);
}

TEST_F(ArchiveFiles, WithoutAUserFolderNothingIsWrittenAnywhere)
{
    IStandardFolders::setInstance(nullptr);
    EXPECT_FALSE(save(1));
    EXPECT_EQ(load(), -1);
    EXPECT_FALSE(std::filesystem::exists("name.xml")) << "not even where the program was started";
}

TEST_F(ArchiveFiles, TheOlderArchiveStoresBinFiles)
{
    const StoredNode node(5, adopt(new StoredNode(6)));
    EXPECT_TRUE(FNewArchive::storeObject(u"name", &node));
    EXPECT_TRUE(exists("config/user/name.bin"));
    EXPECT_TRUE(FNewArchive::objectArchiveExists(u"name"));
    StoredNode restored;
    EXPECT_TRUE(FNewArchive::renameObjectArchive(u"name", u"other"));
    EXPECT_FALSE(FNewArchive::restoreObject(u"name", &restored));
    EXPECT_TRUE(FNewArchive::restoreObject(u"other", &restored));
    EXPECT_EQ(restored.number, 5);
    EXPECT_EQ(restored.nextNode()->number, 6);
    EXPECT_TRUE(FNewArchive::removeObjectArchive(u"other"));

    StoredNode refusing;
    refusing.refusesToStore = true;
    EXPECT_FALSE(FNewArchive::storeObject(u"name", &refusing));
    EXPECT_FALSE(FNewArchive::objectArchiveExists(u"name"));
}
