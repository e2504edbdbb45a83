#include "foundation/message/updatehandler.h"
#include "foundation/text/cmstring.h"
#include "services/presets/fmultipreset.h"
#include "tests/services/presets/presetsupport.h"

namespace
{
class Watched : public CmObject
{
    DECLARE_COPYABLE(Watched, CmObject)

    using CmObject::update;
    void update(CmObject*, int message) override { heard += std::to_string(message) + " "; }
    void updateDone(int message) override { done += std::to_string(message) + " "; }

    std::string heard;
    std::string done;
};
} // namespace

TEST(FMultiPreset, ComesBackFromAnArchive)
{
    FMultiPreset preset(true);
    EXPECT_TRUE(preset.addObject(adopt(new CmString(u"a"))));
    EXPECT_TRUE(preset.addObject(node(2)));
    EXPECT_FALSE(preset.addObject(nullptr) || preset.addObject(&preset));
    FMultiPreset restored;
    ASSERT_TRUE(restored.restoreAttributes(*archived(preset)));
    EXPECT_TRUE(restored.holdsCopies());
    ASSERT_EQ(restored.countObjects(), 2u);
    EXPECT_EQ(FCast(StoredNode, restored.getPresetObject(1))->number, 2);
    EXPECT_EQ(restored.getPresetObject(2), nullptr);
}

TEST(FMultiPreset, IsEqualPairByPair)
{
    FMultiPreset preset, same, other, longer;
    for (FMultiPreset* each : {&preset, &same, &longer})
        each->addObject(adopt(new CmString(u"a")));
    other.addObject(adopt(new CmString(u"b")));
    longer.addObject(adopt(new CmString(u"b")));
    EXPECT_TRUE(preset.isEqual(&same));
    EXPECT_EQ(preset.hash(97), same.hash(97));
    EXPECT_FALSE(preset.isEqual(&other) || preset.isEqual(&longer));
}

TEST(FMultiPreset, TellsOfChangesOfItsObjects)
{
    UpdateHandler::instance();
    auto object = adopt(new Watched);
    Watched listener;
    {
        FMultiPreset preset, copies(true);
        EXPECT_TRUE(preset.addObject(object) && copies.addObject(object));
        EXPECT_EQ(preset.getPresetObject(0), object.get());
        EXPECT_NE(copies.getPresetObject(0), object.get());
        for (FMultiPreset* each : {&preset, &copies})
            each->addDependent(&listener);
        object->changed(5);
        EXPECT_EQ(listener.heard, "5 ") << "not from the copy";
        EXPECT_EQ(object->done, "5 ") << "once, by its own change";
        preset.changed(6);
        EXPECT_EQ(object->done, "5 6 ");
        for (FMultiPreset* each : {&preset, &copies})
            each->removeDependent(&listener);
    }
    object->changed(7);
    EXPECT_EQ(listener.heard, "5 6 ");
    EXPECT_EQ(object->getRefCount(), 1u);
}
