#include "storage/xml/fxmltextformat.h"

#include "storage/xml/xmlentities.h"

#include <cstring>

FXmlTextFormat::FXmlTextFormat(uint32 formatOptions, bool useWindowsTable)
    : options(formatOptions),
      windowsTable(useWindowsTable)
{
}

int FXmlTextFormat::format(void* text, int length)
{
    if (!text || length <= 0)
    {
        atLineStart = true;
        afterReturn = false;
        return 0;
    }
    char* out = static_cast<char*>(text);
    const char* end = out + length;
    for (const char* from = out; from < end;)
    {
        char c = *from++;
        const bool endsReturn = c == '\n' && afterReturn;
        afterReturn = c == '\r';
        if (endsReturn || (atLineStart && (c == ' ' || c == '\t')))
            continue;
        atLineStart = c == '\r' || c == '\n';
        if (atLineStart)
            c = (options & kJoinLines) ? ' ' : '\n';
        else if (c == '&' && (options & kDecodeEntities))
            takeEntity(from, end, c);
        *out++ = c;
    }
    return static_cast<int>(out - static_cast<char*>(text));
}

// `from` stands behind the '&'. What is no reference leaves both arguments as they are.
void FXmlTextFormat::takeEntity(const char*& from, const char* end, char& result) const
{
    int length = 0;
    while (from + length < end && length <= kMaxEntityName && from[length] != ';')
        length++;
    if (from + length >= end || length > kMaxEntityName)
        return;
    const uint8 character = decodeXmlEntity(from, length, windowsTable);
    if (character == 0)
        return;
    result = static_cast<char>(character);
    from += length + 1;
}
