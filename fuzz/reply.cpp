#include "foundation/object/iptr.h"
#include "fuzz/fuzzapplication.h"
#include "uploadmanager/transfer.h"
#include "uploadmanager/uploadrequest.h"

// A chunk of the service's reply, to an upload or to the check of a token.

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    fuzzApplication().run(
        [data, size](PUploadManagerApplication& app)
        {
            const auto request = adopt(new UploadRequest);
            request->path = FNPath(u"/music/a.wav", FPath::kFile);
            CallbackData shared;
            shared.app = &app;
            shared.request = size % 2 == 0 ? request.get() : nullptr;
            std::string chunk(reinterpret_cast<const char*>(data), size);
            require(libcurl_write_callback(chunk.data(), 1, chunk.size(), &shared) == size);
        });
    return 0;
}
