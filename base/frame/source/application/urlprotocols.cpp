#include "application/urlprotocols.h"

#include "application/onetimeprocedure.h"
#include "network/http/furlhttphandler.h"
#include "network/http/furlhttpshandler.h"
#include "storage/url/furlfilehandler.h"

namespace
{
OneTimeProcedure protocols("URL protocols", 0, &registerUrlProtocols);
} // namespace

bool registerUrlProtocols()
{
    static bool isDone = false;
    if (isDone)
        return true;
    isDone = true;
    initFUrlFileHandler();
    initFUrlHttpHandler();
    initFUrlHttpsHandler();
    return true;
}
