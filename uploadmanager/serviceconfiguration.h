#pragma once

#include "foundation/text/fstring.h"

// Where the service is. The hosts come from the attribute file "service" (root "service", keys "API Host" and
// "Web Host", each a host with optional ":port") in the user folder, else in the application folder; a missing value
// is the service's public host. Main thread, or a thread that the main thread waits for.

/// "https://" API host `path`; the result is 8-bit text.
FString makeApiUrl(const char* path);
/// "https://" web host `path`; the result is 8-bit text.
FString makeWebUrl(const char* path);
/// The file of trusted certificates in the application folder, as the system takes paths.
FString getCertificateFile();
