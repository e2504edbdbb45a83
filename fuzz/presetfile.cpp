#include "fuzz/driver/options.h"
#include "fuzz/presetwalk.h"

#include "services/presets/presetfiles.h"

// The files of presets: a pool, a list or a single preset as an XML archive.
extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    auto stream = adopt(new FMemoryStream);
    stream->writeRaw(data, static_cast<int64>(size));
    stream->rewind();
    const LeaksAllowed allowed(data, size);
    FXmlArchive archive(stream, false);
    if (!archive.load(PresetFiles::kRootTag))
        return 0;
    if (auto* pool = FCast(FPresetPool, archive.getGlobalRoot(PresetFiles::kPoolRoot, "FPresetPool")))
        use(*pool);
    if (auto* list = FCast(FPresetList, archive.getGlobalRoot(PresetFiles::kListRoot, "FPresetList")))
        use(*list);
    FPreset preset;
    if (auto* tree = FCast(FAttributes, archive.getRoot(PresetFiles::kPresetRoot, "FAttributes")))
        preset.restoreAttributes(*tree);
    preset.getObject();
    return 0;
}
