#include "fuzz/driver/options.h"
#include "fuzz/presetwalk.h"

#include "storage/attribute/fnewarchive.h"

// The older file of all presets.
extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    auto stream = adopt(new FMemoryStream);
    stream->writeRaw(data, static_cast<int64>(size));
    stream->rewind();
    const LeaksAllowed allowed(data, size);
    auto pool = adopt(new FPresetPool);
    FNewArchive archive(stream, false);
    pool->internalize(archive);
    use(*pool);
    return 0;
}
