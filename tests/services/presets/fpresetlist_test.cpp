#include "foundation/message/updatehandler.h"
#include "services/presets/fpresetpointerlist.h"
#include "services/presets/fpresetpool.h"
#include "storage/attribute/fnewarchive.h"
#include "tests/services/presets/presetsupport.h"

namespace
{
IPtr<FPresetList> sampleList()
{
    auto list = adopt(new FPresetList(u"sounds", u"Sounds"));
    list->addPreset(node(1), u"One");
    FPresetList* drums = list->addSubList(u"Drums");
    drums->addPreset(node(3), u"Three", false, false);
    drums->addSubList(u"Loud")->addPreset(node(4), u"Four");
    list->addPreset(node(2), u"Two", false);
    return list;
}

/// A list with the ID "l1" and so on, as an archive has it.
std::string storedList(int number, const std::string& items)
{
    const std::string digits = std::to_string(number);
    return "<obj class=\"FPresetList\" ID=\"" + digits + "\"><string name=\"ID\" value=\"l" + digits +
           "\"/><list name=\"Items\" type=\"obj\">" + items + "</list></obj>";
}

constexpr const char* kSample = "One=1 Two=2 Drums(Three=3 Loud(Four=4))";

/// Hears of changes.
class Listener : public CmObject
{
    DECLARE_TYPE(Listener, CmObject)

    using CmObject::update;
    void update(CmObject*, int message) override { messages += std::to_string(message) + " "; }

    std::string messages;
};
} // namespace

TEST(FPresetList, CountsPresetsApartFromLists)
{
    const auto list = sampleList();
    EXPECT_EQ(presetsOf(*list), kSample);
    EXPECT_EQ(list->findPreset(u"Two"), 1);
    EXPECT_EQ(list->getSubListByName(u"Drums"), list->getSubList(0));
    EXPECT_EQ(list->addSubList(u"Drums"), list->getSubList(0)) << "there already";
    EXPECT_EQ(list->getSubListByName(u"drums"), nullptr);
    for (const int outside : {-1, 2})
    {
        EXPECT_EQ(list->getPresetName(outside), nullptr);
        EXPECT_EQ(list->getPresetObject(outside), nullptr);
        EXPECT_EQ(list->getSubList(outside), nullptr);
        EXPECT_FALSE(list->canModifiyPreset(outside) || list->removePresetAt(outside));
        EXPECT_FALSE(list->setPresetName(outside, u"x") || list->resetRenameState(outside));
    }
    EXPECT_EQ(list->addPreset(nullptr, u"none"), -1);
    EXPECT_TRUE(list->removePresetAt(0));
    EXPECT_EQ(presetsOf(*list), "Two=2 Drums(Three=3 Loud(Four=4))");
}

TEST(FPresetList, KeepsTwoFlagsOfEachPreset)
{
    const auto list = sampleList();
    EXPECT_TRUE(list->canModifiyPreset(0));
    EXPECT_FALSE(list->canModifiyPreset(1));
    FPresetList& drums = *list->getSubList(0);
    EXPECT_FALSE(drums.presetRenamed(0));
    EXPECT_TRUE(drums.setPresetName(0, u"Drei"));
    EXPECT_TRUE(drums.presetRenamed(0));
    EXPECT_TRUE(drums.resetRenameState(0));
    EXPECT_FALSE(drums.presetRenamed(0));
    list->removeNonModifyPresets();
    EXPECT_EQ(presetsOf(*list), "One=1 Drums(Drei=3 Loud(Four=4))") << "only its own";
}

TEST(FPresetList, CollectsObjectsIntoContainersOfAnyMode)
{
    const int before = StoredNode::alive;
    {
        const auto list = sampleList();
        for (const int16 mode : {CmContainer::kShared, CmContainer::kTaken, CmContainer::kRetained})
        {
            CmArray objects;
            objects.setOwnership(mode);
            EXPECT_EQ(list->collectPresetObjects(objects), 4);
            EXPECT_EQ(objects.at(0), list->getPresetObject(0));
        }
        EXPECT_EQ(list->getPresetObject(0)->getRefCount(), 1u);
    }
    EXPECT_EQ(StoredNode::alive, before);
}

TEST(FPresetList, ComesBackFromAnArchive)
{
    const auto list = sampleList();
    FPresetList restored(u"other");
    restored.addPreset(node(9), u"replaced");
    ASSERT_TRUE(restored.restoreAttributes(*archived(*list)));
    EXPECT_EQ(presetsOf(restored), kSample);
    EXPECT_EQ(utf8(restored.getID()), "sounds");
    EXPECT_EQ(utf8(restored.getName()), "Sounds");
    EXPECT_FALSE(restored.canModifiyPreset(1));
    EXPECT_TRUE(restored.presetRenamed(1));
    EXPECT_FALSE(restored.getSubList(0)->presetRenamed(0));
}

TEST(FPresetList, StoresCopiesOfItsItems)
{
    const auto list = sampleList();
    FAttributes tree;
    ASSERT_TRUE(list->storeAttributes(tree));
    list->setPresetName(0, u"Uno");
    list->removePresetAt(1);
    FPresetList restored;
    ASSERT_TRUE(restored.restoreAttributes(tree));
    EXPECT_EQ(presetsOf(restored), kSample);
    EXPECT_EQ(restored.getPresetObject(0), list->getPresetObject(0)) << "the objects are shared";
}

TEST(FPresetList, TakesTheIDForAMissingNameAndFailsWithoutAnID)
{
    FAttributes tree;
    tree.set("Name", u"Name");
    FPresetList list;
    EXPECT_FALSE(list.restoreAttributes(tree));
    tree.set("ID", u"id");
    EXPECT_TRUE(list.restoreAttributes(tree));
    EXPECT_EQ(utf8(list.getName()), "Name");
    tree.removeAttribute("Name");
    EXPECT_TRUE(list.restoreAttributes(tree));
    EXPECT_EQ(utf8(list.getName()), "id");
}

TEST(FPresetList, ReadsTheOlderForm)
{
    const auto list = sampleList();
    FAttributes tree;
    tree.set("ID", u"id");
    for (int i = 0; i < 2; i++)
        tree.queueMember("Presets", *list->getPreset(i));
    tree.queueMember("SubLists", *list->getSubList(0));
    FPresetList restored;
    EXPECT_TRUE(restored.restoreAttributes(tree));
    EXPECT_EQ(presetsOf(restored), kSample);
    tree.queueObject("Items", adopt(new FPreset(u"new", node(7), 0)));
    EXPECT_TRUE(restored.restoreAttributes(tree));
    EXPECT_EQ(presetsOf(restored), "new=7") << "the older form counts only where there is no newer one";
}

TEST(FPresetList, ReadsTheBinaryForm)
{
    const auto list = sampleList();
    auto stream = adopt(new FMemoryStream);
    {
        FNewArchive archive(stream, true);
        ASSERT_TRUE(list->externalize(archive));
    }
    const std::string whole = contentOf(*stream);
    for (size_t size = 0; size <= whole.size(); size++)
    {
        const auto cut = streamOf(whole.substr(0, size));
        FNewArchive archive(cut, false);
        FPresetList restored;
        ASSERT_EQ(restored.internalize(archive), size == whole.size()) << "cut at " << size;
        EXPECT_TRUE(size < whole.size() || presetsOf(restored) == kSample);
    }
}

TEST(FPresetList, FormsATreeWhateverAFileSays)
{
    // Lists that contain themselves, one that is in two lists, and two that contain each other.
    const std::string text =
        "<?xml version=\"1.0\"?><Test><string name=\"ID\" value=\"top\"/>"
        "<list name=\"Items\" type=\"obj\"><item value=\"1\"/><item value=\"1\"/><item value=\"2\"/>"
        "<item value=\"4\"/><item value=\"5\"/></list>" +
        storedList(1, "<item value=\"2\"/><item value=\"1\"/>") +
        storedList(2, "<item value=\"2\"/><item value=\"3\"/>") + storedList(4, "<item value=\"5\"/>") +
        storedList(5, "<item value=\"4\"/>") +
        "<obj class=\"FPreset\" ID=\"3\"><string name=\"Name\" value=\"self\"/>"
        "<obj name=\"Object\" ID=\"3\"/></obj></Test>";
    FPresetList list;
    {
        FAttributes tree;
        ASSERT_TRUE(FXmlArchive(streamOf(text), false).loadAttributes("Test", tree));
        EXPECT_TRUE(list.restoreAttributes(tree));
    }
    EXPECT_EQ(presetsOf(list), "l1(l2(self=?)) l5(l4())");
    EXPECT_EQ(list.getSubList(0)->getRefCount(), 1u) << "what was refused holds nothing";
    auto copy = adopt(static_cast<FPresetList*>(list.newCopy()));
    EXPECT_EQ(presetsOf(*copy), presetsOf(list));
}

TEST(FPreset, RefusesAnObjectThatLeadsBackToIt)
{
    const std::string text =
        "<?xml version=\"1.0\"?><Test><obj name=\"Preset\" ID=\"1\"/>"
        "<obj class=\"FPreset\" ID=\"1\"><obj name=\"Object\" ID=\"2\"/></obj>"
        "<obj class=\"FMultiPreset\" ID=\"2\"><list name=\"Objects\" type=\"obj\">"
        "<item value=\"3\"/><item value=\"1\"/></list></obj>"
        "<obj class=\"StoredNode\" ID=\"3\"><int name=\"Number\" value=\"3\"/></obj></Test>";
    const int before = StoredNode::alive;
    {
        FAttributes tree;
        ASSERT_TRUE(FXmlArchive(streamOf(text), false).loadAttributes("Test", tree));
        const auto* preset = FCast(FPreset, tree.getObject("Preset", "FPreset"));
        ASSERT_TRUE(preset);
        EXPECT_EQ(preset->getObject(), nullptr);
    }
    EXPECT_EQ(StoredNode::alive, before) << "a ring would never be released";
}

TEST(FPreset, KeepsObjectsOfClassesThatItDoesNotKnow)
{
    const std::string text =
        "<?xml version=\"1.0\"?><Test><string name=\"Name\" value=\"n\"/>"
        "<obj name=\"Object\" ID=\"1\"/>"
        "<obj class=\"FMissing\" ID=\"1\"><int name=\"Level\" value=\"7\"/></obj></Test>";
    FPreset preset;
    {
        FAttributes tree;
        ASSERT_TRUE(FXmlArchive(streamOf(text), false).loadAttributes("Test", tree));
        EXPECT_TRUE(preset.restoreAttributes(tree));
    }
    EXPECT_EQ(preset.getObject(), nullptr);
    const auto stored = archived(preset);
    EXPECT_EQ(stored->getObjectAttributes("Object")->getInt("Level"), 7) << "written again as it was";
}

TEST(FPresetPointer, FollowsItsPreset)
{
    UpdateHandler::instance();
    gPresetPool = new FPresetPool;
    const auto list = sampleList();
    gPresetPool->addPresetList(list);
    FPresetPointerList favourites;
    EXPECT_TRUE(favourites.addPointerTo(*list, 1));
    EXPECT_FALSE(favourites.addPointerTo(*list, 1)) << "is there already";
    EXPECT_FALSE(favourites.addPointerTo(*list, 5));
    FPresetPointer& pointer = *favourites.pointerAt(0);
    Listener listener;
    pointer.addDependent(&listener);
    EXPECT_EQ(pointer.getPresetObject(), list->getPresetObject(1));
    list->setPresetName(1, u"Zwei");
    EXPECT_EQ(utf8(pointer.getPresetName()), "Zwei");
    EXPECT_EQ(listener.messages, "1 ");
    EXPECT_EQ(pointer.getPresetObject(), list->getPresetObject(1));

    FPresetPointerList restored;
    EXPECT_TRUE(restored.restoreAttributes(*archived(favourites)));
    EXPECT_EQ(restored.pointerAt(0)->getPresetObject(), list->getPresetObject(1));
    list->removePresetAt(1);
    EXPECT_EQ(pointer.getPresetObject(), nullptr);
    EXPECT_EQ(utf8(pointer.getPresetName()), "Zwei");
    pointer.removeDependent(&listener);
    gPresetPool->release();
    gPresetPool = nullptr;
    EXPECT_EQ(pointer.getPresetObject(), nullptr);
}
