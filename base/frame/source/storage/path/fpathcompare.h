#pragma once

#include "foundation/text/conststring.h"

class FPath;

/// The order of paths in a tree: what is in a folder comes right behind the folder, before a sibling that
/// merely has a longer name. "a/", "a/b", "a.b" are in order.
class FPathCompare
{
public:
    /// Compares the whole texts or, with `maxLength` of 0 or above, that many characters at most.
    static int compareTreeStyle(const ConstString& left, const ConstString& right, int maxLength,
                                bool caseSensitive = true);
    /// Without `withNames` only the folder parts are looked at. Case counts where `left` says so.
    static int compareTreeStyle(const FPath* left, const FPath* right, bool withNames);
};
