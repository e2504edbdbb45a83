#include "foundation/message/updatehandler.h"
#include "foundation/text/cmstring.h"
#include "services/presets/fmultipreset.h"
#include "tests/services/presets/presetsupport.h"

TEST(FMultiPreset, ComesBackFromAnArchiveEqualPairByPair)
{
    FMultiPreset preset(true);
    EXPECT_TRUE(preset.addObject(adopt(new CmString(u"a"))));
    EXPECT_TRUE(preset.addObject(adopt(new CmString(u"b"))));
    EXPECT_FALSE(preset.addObject(nullptr) || preset.addObject(&preset));
    FMultiPreset restored, shorter;
    ASSERT_TRUE(restored.restoreAttributes(*archived(preset)));
    EXPECT_TRUE(restored.holdsCopies());
    EXPECT_TRUE(preset.isEqual(&restored));
    EXPECT_EQ(preset.hash(97), restored.hash(97));
    static_cast<CmString*>(restored.getPresetObject(1))->assign(u"c");
    EXPECT_EQ(restored.getPresetObject(2), nullptr);
    shorter.addObject(preset.getPresetObject(0));
    EXPECT_FALSE(preset.isEqual(&restored) || preset.isEqual(&shorter));
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
