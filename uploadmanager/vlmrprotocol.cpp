#include "uploadmanager/vlmrprotocol.h"

#include "application/urlscheme.h"
#include "foundation/object/iptr.h"
#include "storage/path/fnpath.h"
#include "uploadmanager/puploadmanagerapplication.h"

namespace
{
// A URL travels as a path, whole: taken apart as one it would lose a trailing delimiter, of a token perhaps, and have
// its backslashes turned.
class UrlAsPath : public FNPath
{
    DECLARE_COPYABLE(UrlAsPath, FNPath)

    explicit UrlAsPath(const char* text) { url.fromUTF8(text); }

    bool getFullPath(FString& result) const override
    {
        result = url;
        return !url.isEmpty();
    }

private:
    FString url;
};

class VlmrUrlHandler final : public IURLSchemeHandler
{
public:
    void openURL(const char* url) override
    {
        if (PUploadManagerApplication* app = FCast(PUploadManagerApplication, gApplication))
            app->handleRedirect(adopt(new UrlAsPath(url)));
    }
};

VlmrUrlHandler* urlHandler = nullptr;
} // namespace

void registerVlmrProtocol()
{
    if (!urlHandler)
        urlHandler = new VlmrUrlHandler;
    URLScheme::setHandler(kVlmrScheme, urlHandler);
}

void cleanupProtocolHandler()
{
    if (!urlHandler)
        return;
    URLScheme::setHandler(kVlmrScheme, nullptr);
    delete urlHandler;
    urlHandler = nullptr;
}
