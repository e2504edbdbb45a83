#include "services/presets/ffilepresetlist.h"
#include "services/presets/fpresetpool.h"
#include "tests/services/presets/presetsupport.h"

namespace
{
/// Counts the files that are opened.
class CountingFiles : public FNFileSystem
{
    DECLARE_TYPE(CountingFiles, FNFileSystem)

    FStream* openFile(FPath* path, int flags, int* error) override
    {
        opened++;
        return FNFileSystem::openFile(path, flags, error);
    }

    int opened = 0;
};

class FilePresets : public FileTest
{
protected:
    void SetUp() override
    {
        FileTest::SetUp();
        std::filesystem::create_directory(root + "/sounds");
    }

    IPtr<FFilePresetList> open() const { return adopt(new FFilePresetList(*at("sounds", FPath::kFolder))); }
};
} // namespace

TEST_F(FilePresets, EachPresetIsAFile)
{
    const auto list = open();
    EXPECT_EQ(list->addPreset(node(1), u"One"), 0);
    EXPECT_EQ(list->addPreset(node(2), u"Take 10", false), 1);
    EXPECT_EQ(list->addPreset(node(3), u"Take 9"), 2);
    EXPECT_EQ(list->addPreset(node(4), u"One"), 3);
    EXPECT_EQ(list->addPreset(node(5), u"1/2 v1.5"), 4);
    list->addSubList(u"Drums")->addPreset(node(6), u"Six");
    for (const char* file : {"One.pxml", "One-01.pxml", "1_2 v1.5.pxml", "Drums/Six.pxml"})
        EXPECT_TRUE(exists("sounds/" + std::string(file))) << file;
    EXPECT_EQ(presetsOf(*list), "One=1 Take 10=2 Take 9=3 One-01=4 1_2 v1.5=5 Drums(Six=6)");
    EXPECT_NE(contentOf("sounds/One.pxml").find("<Presets>"), std::string::npos);
    EXPECT_NE(contentOf("sounds/One.pxml").find("<root name=\"Preset\">"), std::string::npos);
    EXPECT_NE(contentOf("sounds/One.pxml").find("<int name=\"Can Modify\" value=\"1\"/>"), std::string::npos);

    const auto next = open();
    EXPECT_EQ(presetsOf(*next), "1_2 v1.5=5 One=1 One-01=4 Take 9=3 Take 10=2 Drums(Six=6)");
    EXPECT_FALSE(next->canModifiyPreset(4));
    EXPECT_TRUE(next->canModifiyPreset(0));
    CmArray objects;
    EXPECT_EQ(next->collectPresetObjects(objects), 6);
    next->removeNonModifyPresets();
    EXPECT_FALSE(exists("sounds/Take 10.pxml"));
    std::filesystem::remove(root + "/sounds/One.pxml");
    EXPECT_FALSE(next->removePresetAt(1)) << "what can't be removed stays";
    EXPECT_EQ(next->countPresets(), 4);
}

TEST_F(FilePresets, ThousandsOpenWithoutAFileBeingRead)
{
    const auto one = open();
    one->addPreset(node(1), u"Preset");
    for (int i = 0; i < 10000; i++)
        std::filesystem::create_hard_link(root + "/sounds/Preset.pxml",
                                          root + "/sounds/Preset " + std::to_string(i) + ".pxml");
    const auto counting = adopt(new CountingFiles);
    gFileSystem = counting;
    FFilePresetList list(*at("sounds", FPath::kFolder));
    EXPECT_EQ(list.countPresets(), 10001);
    for (int i = 0; i < list.countPresets(); i++)
        ASSERT_TRUE(list.getPresetName(i));
    EXPECT_EQ(utf8(list.getPresetName(10000)), "Preset 9999");
    EXPECT_EQ(list.findPreset(u"Preset 77"), 78);
    EXPECT_EQ(counting->opened, 0);
    EXPECT_TRUE(list.getPresetObject(78) && list.getPresetObject(78));
    EXPECT_EQ(counting->opened, 1) << "when the object is asked for";
}

TEST_F(FilePresets, UnuseDropsWhatWasRead)
{
    open()->addPreset(node(1), u"One");
    open()->addSubList(u"Drums")->addPreset(node(2), u"Two");
    const int before = StoredNode::alive;
    const auto list = open();
    CmArray objects;
    EXPECT_EQ(list->collectPresetObjects(objects), 2);
    EXPECT_TRUE(list->resetRenameState(0));
    EXPECT_EQ(StoredNode::alive, before + 2);
    list->unuse();
    EXPECT_EQ(StoredNode::alive, before);
    EXPECT_EQ(presetsOf(*list), "One=1 Drums(Two=2)") << "read again";
    EXPECT_FALSE(list->presetRenamed(0) || open()->presetRenamed(0)) << "it is in the file";
}

TEST_F(FilePresets, RenamesTheFile)
{
    auto list = open();
    list->addPreset(node(1), u"One", true, false);
    list->addPreset(node(2), u"Two");
    EXPECT_FALSE(list->presetRenamed(0));
    EXPECT_FALSE(list->setPresetName(0, u"Two")) << "taken";
    EXPECT_EQ(presetsOf(*list), "One=1 Two=2");
    EXPECT_TRUE(list->setPresetName(0, u" a*b "));
    EXPECT_EQ(presetsOf(*list), "a_b=1 Two=2");
    EXPECT_TRUE(exists("sounds/a_b.pxml") && !exists("sounds/One.pxml"));
    EXPECT_TRUE(list->presetRenamed(0));
    EXPECT_TRUE(list->setPresetName(0, u"a*b")) << "the name that it has";
    EXPECT_TRUE(list->setPresetName(1, nullptr));
    EXPECT_EQ(utf8(list->getPresetName(1)), "_");
    EXPECT_TRUE(open()->presetRenamed(1)) << "also in the next run";
    for (const int number : {3, 4})
        list->addPreset(node(number), std::u16string(400, u'ä').c_str(), true, false);
    EXPECT_EQ(presetsOf(*open()).substr(0, 8), "a_b=1 _=");
    EXPECT_EQ(open()->countPresets(), 4) << "also a long name has room for a number";
    EXPECT_FALSE(open()->presetRenamed(2)) << "its file has the name that it was given";
}

TEST_F(FilePresets, AFileThatDoesNotLoadGivesANullObject)
{
    open()->addPreset(node(1), u"Whole", false);
    const std::string whole = contentOf("sounds/Whole.pxml");
    for (size_t i = 0; i + 1 < whole.size(); i++)
    {
        // A file that is emptied and written again waits for the disk.
        std::filesystem::remove(root + "/sounds/Cut.pxml");
        put("sounds/Cut.pxml", whole.substr(0, i));
        const auto list = open();
        ASSERT_EQ(list->getPresetObject(0), nullptr) << "cut at " << i;
        ASSERT_TRUE(list->canModifiyPreset(0));
        ASSERT_EQ(list->countPresets(), 2);
    }
    put("sounds/Cut.pxml", "<damaged>");
    EXPECT_TRUE(open()->resetRenameState(0));
    EXPECT_EQ(contentOf("sounds/Cut.pxml"), "<damaged>") << "what can't be read isn't written over";
    put("sounds/notes.txt", whole);
    put("sounds/.pxml", whole);
    std::filesystem::create_directory_symlink(root, root + "/sounds/up");
    std::filesystem::create_symlink(root + "/sounds/Whole.pxml", root + "/sounds/link.PXML");
    std::filesystem::create_symlink("/dev/zero", root + "/sounds/Endless.pxml");
    EXPECT_EQ(presetsOf(*open()), "Cut=? Endless=? link=1 Whole=1");
}

TEST_F(FilePresets, ReadsFilesWhoseRootTagIsTheRoot)
{
    open()->addPreset(node(1), u"One");
    std::string text = contentOf("sounds/One.pxml");
    for (size_t at = text.find("Presets>"); at != std::string::npos; at = text.find("Presets>"))
        text.replace(at, 8, "Preset>");
    put("sounds/One.pxml", text);
    EXPECT_EQ(presetsOf(*open()), "One=1");
}

TEST_F(FilePresets, AnObjectThatCannotBeStoredLeavesNoFile)
{
    const auto list = open();
    auto stubborn = node(1);
    stubborn->refusesToStore = true;
    EXPECT_EQ(list->addPreset(stubborn, u"One"), -1);
    EXPECT_EQ(list->countPresets(), 0);
    EXPECT_TRUE(std::filesystem::is_empty(root + "/sounds"));
    put("sounds/file", "");
    EXPECT_EQ(list->addSubList(u"file"), nullptr) << "no folder can be made there";
    FFilePresetList missing(*at("missing", FPath::kFolder));
    EXPECT_EQ(missing.countPresets(), 0);
}
