#include "containers/keyed/cmdictionary.h"
#include "fuzz/fuzzapplication.h"
#include "uploadmanager/urlaspath.h"

// A URL that a browser was redirected to, from whatever page.

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    const std::string bytes(reinterpret_cast<const char*>(data), size);
    fuzzApplication().run(
        [&bytes](PUploadManagerApplication& app)
        {
            UrlAsPath url(bytes.c_str());
            CmDictionary values;
            values.setOwnership(CmContainer::kTaken);
            app.parseUrl(&url, values);
            require(app.handleRedirect(&url));
        });
    return 0;
}
