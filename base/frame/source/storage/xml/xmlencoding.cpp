#include "containers/value/buffer.h"
#include "storage/xml/fxmlwriter.h"
#include "storage/xml/xmlentities.h"
#include "storage/xml/xmltext.h"

#include <array>
#include <cstdio>
#include <cstring>
#include <string_view>

namespace
{
using NameTable = std::array<const char*, 256>;

/// The names under which characters are written, by their bytes; null for those that are written as they are.
template <size_t Count>
NameTable namesOf(const FXmlEntity8 (&entities)[Count])
{
    NameTable names{};
    for (const FXmlEntity8& entity : entities)
        if (entity.encode && entity.character != 0 && !names[entity.character])
            names[entity.character] = entity.name;
    return names;
}

const NameTable& namesForMarkup()
{
    static const NameTable names = namesOf(gUTF8EntityTable8);
    return names;
}

const NameTable& namesForBytes()
{
    static const NameTable names = namesOf(gEntityTable8Mac);
    return names;
}

void appendName(Buffer& out, const char* name)
{
    out.put('&');
    Xml::appendText(out, name);
    out.put(';');
}

/// The characters of ASCII that are no markup.
constexpr std::array<bool, 0x80> makePlainCharacters()
{
    std::array<bool, 0x80> plain{};
    for (unsigned c = 0; c < plain.size(); c++)
        plain[c] = c != '&' && c != '<' && c != '>' && c != '"';
    return plain;
}
constexpr std::array<bool, 0x80> kPlain = makePlainCharacters();

bool isPlain(char16 c)
{
    return c < kPlain.size() && kPlain[c];
}

/// Appends the characters up to the first one that isn't plain; gives their number.
size_t appendPlain(Buffer& out, std::u16string_view text)
{
    const uint32 before = out.getFillSize();
    if (!out.grow(before + static_cast<uint32>(text.size())))
        return text.size();
    char* to = out + before;
    size_t count = 0;
    for (; count < text.size() && isPlain(text[count]); count++)
        to[count] = static_cast<char>(text[count]);
    out.setFillSize(before + static_cast<uint32>(count));
    return count;
}
} // namespace

void FXmlWriter::encodeString(Buffer& out, const char* text, bool utf8)
{
    const NameTable& names = utf8 ? namesForMarkup() : namesForBytes();
    const char* run = text;
    for (; text && *text; text++)
    {
        const auto byte = static_cast<unsigned char>(*text);
        const bool isNumber = !utf8 && byte >= 0x80;
        if (!names[byte] && !isNumber)
            continue;
        out.put(run, static_cast<uint32>(text - run));
        run = text + 1;
        if (names[byte])
        {
            appendName(out, names[byte]);
            continue;
        }
        char number[16];
        snprintf(number, sizeof(number), "&#x%x;", byte);
        Xml::appendText(out, number);
    }
    out.put(run, static_cast<uint32>(text - run));
}

void FXmlWriter::encodeString(Buffer& out, const char16* text)
{
    encodeString(out, std::u16string_view(text ? text : u""));
}

void FXmlWriter::encodeString(Buffer& out, std::u16string_view text)
{
    while (true)
    {
        text.remove_prefix(appendPlain(out, text));
        if (text.empty())
            return;
        if (text[0] < kPlain.size())
        {
            appendName(out, namesForMarkup()[text[0]]);
            text.remove_prefix(1);
            continue;
        }
        // Both halves of a pair stand in one run.
        size_t run = 1;
        while (run < text.size() && text[run] >= kPlain.size())
            run++;
        Xml::appendUtf8(out, text.substr(0, run));
        text.remove_prefix(run);
    }
}
