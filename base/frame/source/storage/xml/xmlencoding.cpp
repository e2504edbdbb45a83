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

bool isMarkup(char16 c)
{
    return c < 0x80 && namesForMarkup()[c];
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
    const std::u16string_view whole(text ? text : u"");
    size_t done = 0;
    for (size_t i = 0; i < whole.size(); i++)
    {
        if (!isMarkup(whole[i]))
            continue;
        Xml::appendUtf8(out, whole.substr(done, i - done));
        appendName(out, namesForMarkup()[whole[i]]);
        done = i + 1;
    }
    Xml::appendUtf8(out, whole.substr(done));
}
