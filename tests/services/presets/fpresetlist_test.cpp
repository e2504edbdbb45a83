#include "foundation/message/updatehandler.h"
#include "services/presets/fmultipreset.h"
#include "services/presets/fpresetpointerlist.h"
#include "services/presets/fpresetpool.h"
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

// Pieces of an archive. The ID of list 1 is "l1".

std::string object(const char* type, int id, const std::string& values)
{
    return "<obj class=\"" + std::string(type) + "\" ID=\"" + std::to_string(id) + "\">" + values + "</obj>";
}

std::string objects(const char* name, std::initializer_list<int> ids)
{
    std::string items;
    for (const int id : ids)
        items += "<item value=\"" + std::to_string(id) + "\"/>";
    return "<list name=\"" + std::string(name) + "\" type=\"obj\">" + items + "</list>";
}

std::string listOf(int number, std::initializer_list<int> items)
{
    return "<string name=\"ID\" value=\"l" + std::to_string(number) + "\"/>" + objects("Items", items);
}

std::string presetOf(int id)
{
    return "<string name=\"Name\" value=\"p\"/><obj name=\"Object\" ID=\"" + std::to_string(id) + "\"/>";
}

bool load(const std::string& content, FAttributes& tree)
{
    const std::string text = "<?xml version=\"1.0\"?><Test>" + content + "</Test>";
    return FXmlArchive(streamOf(text), false).loadAttributes("Test", tree);
}

constexpr const char* kSample = "One=1 Two=2 Drums(Three=3 Loud(Four=4))";
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
    const auto stored = archived(*list);
    FAttributes tree;
    ASSERT_TRUE(list->storeAttributes(tree));
    list->setPresetName(0, u"Uno");
    list->removePresetAt(1);
    FPresetList restored(u"other");
    for (FAttributes* each : {&tree, stored.get()})
    {
        restored.addPreset(node(9), u"replaced");
        ASSERT_TRUE(restored.restoreAttributes(*each));
        EXPECT_EQ(presetsOf(restored), kSample) << "a tree has copies of the items";
    }
    EXPECT_EQ(utf8(restored.getID()), "sounds");
    EXPECT_EQ(utf8(restored.getName()), "Sounds");
    EXPECT_FALSE(restored.canModifiyPreset(1));
    EXPECT_TRUE(restored.presetRenamed(1));
    EXPECT_FALSE(restored.getSubList(0)->presetRenamed(0));
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

TEST(FPresetList, FormsATreeWhateverAFileSays)
{
    // Lists that contain themselves, one that is in two lists, and two that contain each other.
    FPresetList list;
    {
        FAttributes tree;
        ASSERT_TRUE(load(listOf(0, {1, 1, 2, 4, 5}) + object("FPresetList", 1, listOf(1, {2, 1})) +
                             object("FPresetList", 2, listOf(2, {2, 3})) + object("FPreset", 3, presetOf(3)) +
                             object("FPresetList", 4, listOf(4, {5})) +
                             object("FPresetList", 5, listOf(5, {4})),
                         tree));
        EXPECT_TRUE(list.restoreAttributes(tree));
    }
    EXPECT_EQ(presetsOf(list), "l1(l2(p=?)) l5(l4())");
    EXPECT_EQ(list.getSubList(0)->getRefCount(), 1u) << "what was refused holds nothing";
    auto copy = adopt(static_cast<FPresetList*>(list.newCopy()));
    EXPECT_EQ(presetsOf(*copy), presetsOf(list));
}

TEST(FPresetPool, HoldsNothingThatLeadsBackToItsHolder)
{
    // The second list leads to the pool, and the third by the second. In the first one are several objects, of which
    // the third leads to all of them, and the fourth by the third; and a list in the older form, whose first preset
    // holds the list.
    const auto itemsOf = [](const char* name, const std::string& first, const std::string& second)
    {
        return "<list name=\"" + std::string(name) + "\" type=\"list\"><item>" + first + "</item><item>" +
               second + "</item></list>";
    };
    const std::string number = "<int name=\"Number\" value=\"8\"/>";
    const std::string lists =
        itemsOf("Lists", listOf(1, {2, 7}), listOf(2, {3}) + "</item><item>" + listOf(3, {10}));
    const int before = StoredNode::alive;
    {
        FAttributes tree;
        ASSERT_TRUE(
            load("<obj name=\"Pool\" ID=\"1\"/>" + object("FPresetPool", 1, lists) +
                     object("FPreset", 2, presetOf(4)) + object("FPreset", 3, presetOf(1)) +
                     object("FMultiPreset", 4, objects("Objects", {4, 8, 5, 6})) +
                     object("FMultiPreset", 5, objects("Objects", {4})) +
                     object("FMultiPreset", 6, objects("Objects", {5})) +
                     object("FPresetList", 7, listOf(7, {}) + itemsOf("Presets", presetOf(7), presetOf(9))) +
                     object("StoredNode", 8, number) + object("StoredNode", 9, number) +
                     object("FPreset", 10, presetOf(3)),
                 tree));
        const auto* pool = FCast(FPresetPool, tree.getObject("Pool", "FPresetPool"));
        ASSERT_TRUE(pool && pool->countLists() == 1);
        EXPECT_EQ(presetsOf(*pool->getListAt(0)), "p=? l7(p=8)");
        const auto* several = FCast(FMultiPreset, pool->getListAt(0)->getPresetObject(0));
        EXPECT_TRUE(several && several->countObjects() == 1);
    }
    EXPECT_EQ(StoredNode::alive, before) << "a circle would never be released";
}

TEST(FPreset, KeepsObjectsOfClassesThatItDoesNotKnow)
{
    FPreset preset;
    {
        FAttributes tree;
        ASSERT_TRUE(load(presetOf(1) + object("FMissing", 1, "<int name=\"Level\" value=\"7\"/>"), tree));
        EXPECT_TRUE(preset.restoreAttributes(tree));
    }
    EXPECT_EQ(preset.getObject(), nullptr);
    const auto stored = archived(preset);
    EXPECT_EQ(stored->getObjectAttributes("Object")->getInt("Level"), 7) << "written again as it was";
}

TEST(FPreset, LeavesOutAnUnknownObjectThatLeadsBackToIt)
{
    const int before = StoredNode::alive;
    {
        FAttributes tree;
        FPresetList list;
        ASSERT_TRUE(load(listOf(1, {2, 3}) + object("FPreset", 2, presetOf(4)) +
                             object("FPresetList", 3, listOf(3, {5, 6})) +
                             object("FMissing", 4, objects("Objects", {3})) +
                             object("FPreset", 5, presetOf(4)) + object("FPreset", 6, presetOf(7)) +
                             object("StoredNode", 7, "<int name=\"Number\" value=\"8\"/>"),
                         tree));
        ASSERT_TRUE(list.restoreAttributes(tree));
        EXPECT_EQ(presetsOf(list), "p=? l3(p=? p=8)");
        EXPECT_TRUE(archived(*list.getPreset(0))->getObjectAttributes("Object"))
            << "this one closes no circle";
        EXPECT_FALSE(archived(*list.getSubList(0)->getPreset(0))->getObjectAttributes("Object"));
    }
    EXPECT_EQ(StoredNode::alive, before) << "a circle would never be released";
}

TEST(FPreset, LeavesOutAnUnknownObjectThatLaterLeadsBackByAnother)
{
    const int before = StoredNode::alive;
    {
        FAttributes tree;
        FPreset preset;
        ASSERT_TRUE(load(presetOf(1) + object("FMultiPreset", 1, objects("Objects", {2, 3})) +
                             object("FMissing", 2, objects("Objects", {3})) +
                             object("FMultiPreset", 3, objects("Objects", {1, 4})) +
                             object("StoredNode", 4, "<int name=\"Number\" value=\"8\"/>"),
                         tree));
        EXPECT_TRUE(preset.restoreAttributes(tree));
    }
    EXPECT_EQ(StoredNode::alive, before) << "a circle would never be released";
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
    Watched listener;
    pointer.addDependent(&listener);
    EXPECT_EQ(pointer.getPresetObject(), list->getPresetObject(1));
    list->setPresetName(1, u"Zwei");
    EXPECT_EQ(utf8(pointer.getPresetName()), "Zwei");
    EXPECT_EQ(listener.heard, "1 ");
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
