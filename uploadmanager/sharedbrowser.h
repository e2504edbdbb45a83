#pragma once

#include "foundation/object/types.h"

// The one browser of the process, for the login page (main thread) and the edit page (upload thread).

/// Opens `url` in the desktop's default browser; the browser object is made at the first use.
bool openInSharedBrowser(const char16* url);
/// Main thread, when no transfer runs any more.
void deleteSharedBrowser();
