#pragma once

#include "foundation/text/conststring.h"

/// Takes lines of text for whoever looks into the program. One thread at a time.
class FConsole
{
public:
    virtual ~FConsole() = default;
    /// The line comes without its end.
    virtual void printLine(const ConstString& line) = 0;
};
