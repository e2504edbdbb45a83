#pragma once

#include "foundation/object/types.h"

/// Normalises the text between tags in place, as `FXmlParser::gotData` delivers it: no indent, one kind of line end.
///
/// The pieces of one text are given in order; a length of 0 ends the text. One thread at a time.
class FXmlTextFormat
{
public:
    /// Bits of the options.
    enum Options : uint32
    {
        /// A line end becomes a blank instead of a line feed.
        kJoinLines = 1,
        /// Entity references are decoded; one that is split between two pieces stays as it is.
        kDecodeEntities = 2
    };

    explicit FXmlTextFormat(uint32 options, bool windowsTable = false);

    /// Gives the new length. `text` isn't terminated.
    int format(void* text, int length);

    static constexpr int kMaxEntityName = 10;

private:
    void takeEntity(const char*& from, const char* end, char& result) const;

    uint32 options;
    bool windowsTable;
    bool atLineStart = true;
    bool afterReturn = false;
};
