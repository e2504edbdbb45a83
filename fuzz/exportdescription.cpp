#include "foundation/object/iptr.h"
#include "fuzz/fuzzapplication.h"
#include "storage/path/fnpath.h"

// An export description as the desktop hands it over: `openFile` makes requests of it or tells why not.

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    FuzzApplication& fuzz = fuzzApplication();
    const std::string path = fuzz.write("description.xml", data, size);
    fuzz.run(
        [&path](PUploadManagerApplication& app)
        {
            const auto description = adopt(new FNPath);
            require(description->fromPlatformPath(path.c_str()));
            app.openFile(description, nullptr);
        });
    return 0;
}
