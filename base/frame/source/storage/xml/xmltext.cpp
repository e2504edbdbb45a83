#include "storage/xml/xmltext.h"

#include "containers/value/buffer.h"
#include "foundation/text/utf8.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>

namespace Xml
{
void assignUtf8(String& target, const char* text, size_t length)
{
    auto* wide = static_cast<char16*>(malloc((length + 1) * sizeof(char16)));
    if (!wide)
        return;
    const size_t count = decodeUtf8(text, static_cast<unsigned>(length), wide, ' ');
    wide[count] = 0;
    if (count < length)
        if (void* fitting = realloc(wide, (count + 1) * sizeof(char16)))
            wide = static_cast<char16*>(fitting);
    target.take(wide, true, static_cast<unsigned>(count));
}

bool isEqualText(std::string_view ascii, const char16* text)
{
    for (const char c : ascii)
        if (*text++ != static_cast<char16>(c))
            return false;
    return *text == 0;
}

bool isXmlSpace(const char* text, size_t length)
{
    return std::all_of(text, text + length, [](char c) { return isXmlSpace(c); });
}

void appendUtf8(Buffer& out, std::u16string_view text)
{
    constexpr size_t kMostBytes = 3;
    const uint32 before = out.getFillSize();
    const auto length = static_cast<uint32>(text.size());
    if (out.grow(before + length * static_cast<uint32>(kMostBytes)))
        out.setFillSize(before + encodeUtf8(text.data(), length, out + before, '?'));
}

void appendText(Buffer& out, const char* text)
{
    out.put(text, static_cast<uint32>(strlen(text)));
}
} // namespace Xml
