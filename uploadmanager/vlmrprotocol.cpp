#include "uploadmanager/vlmrprotocol.h"

#include "application/urlscheme.h"
#include "foundation/object/iptr.h"
#include "uploadmanager/puploadmanagerapplication.h"
#include "uploadmanager/urlaspath.h"

namespace
{
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
