#pragma once

#include "foundation/text/string.h"

#include <ostream>
#include <string>

/// A failed comparison of texts shows width and characters: L"wide" or "narrow".
inline void PrintTo(const ConstString& text, std::ostream* out)
{
    String copy(text);
    copy.toMultiByte(kEncodingUtf8);
    *out << (text.isWideString() ? "L\"" : "\"") << copy.text8() << '"';
}

inline String wide(const char* utf8)
{
    String text;
    text.fromUTF8(utf8);
    return text;
}

/// The characters and their width at once: "narrow:x", "wide:x".
inline std::string shape(const ConstString& text)
{
    String copy(text);
    const std::string width = text.isWideString() ? "wide:" : "narrow:";
    copy.toMultiByte(kEncodingUtf8);
    return width + copy.text8();
}
