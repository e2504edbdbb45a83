#pragma once

#include "foundation/text/fstring.h"

class FNPath;
class FPath;

/// `text` in UTF-8, the form of all text that leaves the program.
FString toWireText(const ConstString& text);

/// The bytes by which the disk knows `path`.
FString toWirePath(const FNPath& path);

/// The whole text of `path`; empty where it has none.
FString getPathText(const FPath* path);
