#include "application/urlprotocols.h"

#include "application/onetimeprocedure.h"
#include "storage/url/furl.h"
#include "storage/url/furlfilehandler.h"

namespace
{
// Nothing here speaks these protocols yet; a URL of theirs still knows its port.
FUrlHandler* createNothing(FUrl&)
{
    return nullptr;
}

OneTimeProcedure protocols("URL protocols", 0, &registerUrlProtocols);
} // namespace

bool registerUrlProtocols()
{
    static bool isDone = false;
    if (isDone)
        return true;
    isDone = true;
    initFUrlFileHandler();
    FUrl::registerHandler(FString("http"), 80, createNothing);
    FUrl::registerHandler(FString("https"), 443, createNothing);
    return true;
}
