#pragma once

#include "foundation/text/string.h"

#include <string_view>

class Buffer;

namespace Xml
{
/// Gives `target` the wide text of `length` bytes in UTF-8, with a blank for each byte that means nothing.
void assignUtf8(String& target, const char* text, size_t length);
inline void assignUtf8(String& target, std::string_view text)
{
    assignUtf8(target, text.data(), text.size());
}
/// Whether the two have the same characters, given one in ASCII.
bool isEqualText(std::string_view ascii, const char16* text);

/// The characters of a text, which is made wide where it isn't.
inline std::u16string_view viewOf(const String& text)
{
    const char16* characters = text.text16();
    return {characters, text.length()};
}

/// Whether the bytes are tabs, line ends and blanks alone.
bool isXmlSpace(const char* text, size_t length);
inline bool isXmlSpace(char c)
{
    return c == ' ' || c == '\n' || c == '\r' || c == '\t';
}

/// Appends the text in UTF-8, without a terminator and without entities.
void appendUtf8(Buffer& out, std::u16string_view text);
/// Appends an 8-bit text as it stands, without its terminator.
void appendText(Buffer& out, const char* text);
} // namespace Xml
