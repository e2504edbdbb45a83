#include "storage/xml/xmltext.h"

#include "containers/value/buffer.h"
#include "foundation/text/itextservices.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>

namespace
{
bool isAscii(const char* text, size_t length)
{
    unsigned char bits = 0;
    for (size_t i = 0; i < length; i++)
        bits |= static_cast<unsigned char>(text[i]);
    return bits < 0x80;
}

size_t runLength(std::u16string_view text, bool ascii)
{
    size_t length = 0;
    while (length < text.size() && (text[length] < 0x80) == ascii)
        length++;
    return length;
}

void appendAscii(Buffer& out, const char16* text, size_t length)
{
    char piece[256];
    for (size_t done = 0; done < length;)
    {
        const size_t count = std::min(length - done, sizeof(piece));
        for (size_t i = 0; i < count; i++)
            piece[i] = static_cast<char>(text[done + i]);
        out.put(piece, static_cast<uint32>(count));
        done += count;
    }
}

void appendConverted(Buffer& out, const char16* text, size_t length)
{
    unsigned bytes = 0;
    char* converted =
        ITextServices::instance().toMultiByte(text, static_cast<unsigned>(length), kEncodingUtf8, '?', bytes);
    if (converted)
        out.put(converted, bytes);
    free(converted);
}
} // namespace

namespace Xml
{
void assignUtf8(String& target, const char* text, size_t length)
{
    char16* wide =
        isAscii(text, length) ? static_cast<char16*>(malloc((length + 1) * sizeof(char16))) : nullptr;
    if (!wide)
    {
        target.assign(text, static_cast<int>(length), false);
        target.toWideString(kEncodingUtf8);
        return;
    }
    for (size_t i = 0; i < length; i++)
        wide[i] = static_cast<char16>(text[i]);
    wide[length] = 0;
    target.take(wide, true);
}

void assignUtf8(String& target, const char* text)
{
    assignUtf8(target, text, strlen(text));
}

bool isXmlSpace(const char* text, size_t length)
{
    return std::all_of(text, text + length, [](char c) { return isXmlSpace(c); });
}

void appendUtf8(Buffer& out, std::u16string_view text)
{
    while (!text.empty())
    {
        const bool ascii = text[0] < 0x80;
        const size_t length = runLength(text, ascii);
        if (ascii)
            appendAscii(out, text.data(), length);
        else
            appendConverted(out, text.data(), length);
        text.remove_prefix(length);
    }
}

void appendText(Buffer& out, const char* text)
{
    out.put(text, static_cast<uint32>(strlen(text)));
}
} // namespace Xml
