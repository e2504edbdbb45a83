#include "storage/xml/xmlentities.h"

#include "foundation/text/conststringtable.h"

#include <cstring>

// Both 8-bit tables are one list; beyond the characters of ASCII only the Windows one has bytes for the names. Its
// places are those that files rely on, the missing and the doubled ones among them.
#define ENTITIES(latin)                                                                                      \
    {                                                                                                        \
        {0x22, "quot", true}, {0x26, "amp", true}, {0x3C, "lt", true}, {0x3E, "gt", true},                   \
            {0x5C, "bsol", false}, {0x27, "apos", false}, {0x21, "excl", false}, {0x23, "num", false},       \
            {0x24, "dollar", true}, {0x25, "percnt", false}, {0x28, "lpar", false}, {0x29, "rpar", false},   \
            {0x2A, "ast", false}, {0x2B, "plus", false}, {0x2C, "comma", false}, {0x2D, "hyphen", false},    \
            {0x2E, "period", false}, {0x2F, "sol", false}, {0x3A, "colon", false}, {0x3B, "semi", false},    \
            {0x3D, "equals", false}, {0x3F, "quest", false}, {0x40, "commat", false}, {0x5B, "lsqb", false}, \
            {0x5D, "rsqb", false}, {0x5E, "circ", true}, {0x5F, "horbar", false}, {0x60, "grave", true},     \
            {0x7B, "lcub", false}, {0x7C, "verbar", false}, {0x7D, "rcub", false}, {0x7E, "tilde", false},   \
            {0x0A, "nl", true}, {0x0D, "cr", true}, {latin(0xA0), "nbsp", true},                             \
            {latin(0xA1), "iexcl", false}, {latin(0xA2), "cent", false}, {latin(0xA3), "pound", false},      \
            {latin(0xA4), "curren", false}, {latin(0xA5), "yen", false}, {latin(0xA6), "brvbar", false},     \
            {latin(0xA7), "sect", false}, {latin(0xA8), "uml", false}, {latin(0xA9), "copy", false},         \
            {latin(0xAA), "ordf", false}, {latin(0xAB), "laquo", false}, {latin(0xAC), "not", false},        \
            {latin(0xAE), "reg", false}, {latin(0xAF), "macr", false}, {latin(0xB0), "deg", false},          \
            {latin(0xB1), "plusmn", false}, {latin(0xB2), "sup2", false}, {latin(0xB3), "sup3", false},      \
            {latin(0xB4), "acute", false}, {latin(0xB5), "micro", false}, {latin(0xB6), "para", false},      \
            {latin(0xB7), "middot", false}, {latin(0xB8), "cedil", false}, {latin(0xB9), "sup1", false},     \
            {latin(0xBA), "ordm", false}, {latin(0xBB), "raquo", false}, {latin(0xBC), "frac14", false},     \
            {latin(0xBD), "frac12", false}, {latin(0xBD), "half", false}, {latin(0xBE), "frac34", false},    \
            {latin(0xBF), "iquest", false}, {latin(0xC0), "iquest", false}, {latin(0xC1), "Agrave", false},  \
            {latin(0xC2), "Aacute", false}, {latin(0xC3), "Atilde", false}, {latin(0xC4), "Auml", false},    \
            {latin(0xC5), "Aring", false}, {latin(0xC6), "AElig", false}, {latin(0xC7), "Ccedil", false},    \
            {latin(0xC8), "Egrave", false}, {latin(0xC9), "Eacute", false}, {latin(0xCA), "Ecirc", false},   \
            {latin(0xCB), "Euml", false}, {latin(0xCC), "Igrave", false}, {latin(0xCD), "Iacute", false},    \
            {latin(0xCE), "Icirc", false}, {latin(0xCF), "Iuml", false}, {latin(0xD0), "ETH", false},        \
            {latin(0xD1), "Ntilde", false}, {latin(0xD2), "Ograve", false}, {latin(0xD3), "Oacute", false},  \
            {latin(0xD4), "Ocirc", false}, {latin(0xD5), "Otilde", false}, {latin(0xD6), "Ouml", false},     \
            {latin(0xD7), "times", false}, {latin(0xD8), "Oslash", false}, {latin(0xD9), "Ugrave", false},   \
            {latin(0xDA), "Uacute", false}, {latin(0xDB), "Ucirc", false}, {latin(0xDC), "Uuml", false},     \
            {latin(0xDD), "Yacute", false}, {latin(0xDE), "THORN", false}, {latin(0xDF), "szlig", false},    \
            {latin(0xE0), "agrave", false}, {latin(0xE1), "aacute", false}, {latin(0xE2), "acirc", false},   \
            {latin(0xE3), "atilde", false}, {latin(0xE4), "auml", false}, {latin(0xE5), "aring", false},     \
            {latin(0xE6), "aelig", false}, {latin(0xE7), "ccedil", false}, {latin(0xE8), "egrave", false},   \
            {latin(0xE9), "eacute", false}, {latin(0xEA), "ecirc", false}, {latin(0xEB), "euml", false},     \
            {latin(0xEC), "igrave", false}, {latin(0xED), "iacute", false}, {latin(0xEE), "icirc", false},   \
            {latin(0xEF), "iuml", false}, {latin(0xF0), "eth", false}, {latin(0xF1), "ntilde", false},       \
            {latin(0xF2), "ograve", false}, {latin(0xF3), "oacute", false}, {latin(0xF4), "ocirc", false},   \
            {latin(0xF5), "otilde", false}, {latin(0xF6), "ouml", false}, {latin(0xF7), "divide", false},    \
            {latin(0xF8), "oslash", false}, {latin(0xF9), "ugrave", false}, {latin(0xFA), "uacute", false},  \
            {latin(0xFB), "ucirc", false}, {latin(0xFC), "uuml", false}, {latin(0xFD), "yacute", false},     \
            {latin(0xFE), "thorn", false},                                                                   \
        {                                                                                                    \
            latin(0xFF), "yuml", false                                                                       \
        }                                                                                                    \
    }

#define NO_BYTE(byte) 0
#define LATIN_BYTE(byte) byte

constinit const FXmlEntity8 gEntityTable8Mac[kEntityCount8] = ENTITIES(NO_BYTE);
constinit const FXmlEntity8 gEntityTable8Win[kEntityCount8] = ENTITIES(LATIN_BYTE);

constinit const FXmlEntity8 gUTF8EntityTable8[kEntityCountUtf8] = {
    {38, "amp", true}, {60, "lt", true}, {62, "gt", true}, {39, "apos", false}, {34, "quot", true}};

namespace
{
FXmlEntity16 widen(const FXmlEntity8& entity)
{
    return {entity.character, ConstStringTable::instance().getString(entity.name), entity.encode};
}

/// The value of a digit, or 16 for any other character.
unsigned digitValue(char c)
{
    if (c >= '0' && c <= '9')
        return static_cast<unsigned>(c - '0');
    if (c >= 'a' && c <= 'f')
        return static_cast<unsigned>(c - 'a') + 10;
    if (c >= 'A' && c <= 'F')
        return static_cast<unsigned>(c - 'A') + 10;
    return 16;
}

uint8 decodeNumber(const char* digits, int length, unsigned base)
{
    unsigned value = 0;
    for (int i = 0; i < length; i++)
    {
        const unsigned digit = digitValue(digits[i]);
        if (digit >= base)
            return 0;
        value = value * base + digit;
    }
    return static_cast<uint8>(value);
}

bool isName(const char* entityName, const char* name, size_t length)
{
    return *entityName == *name && strncmp(entityName, name, length) == 0 && entityName[length] == 0;
}
} // namespace

FXmlEntity16 gEntityTable16[kEntityCountUtf8] = {widen(gUTF8EntityTable8[0]), widen(gUTF8EntityTable8[1]),
                                                 widen(gUTF8EntityTable8[2]), widen(gUTF8EntityTable8[3]),
                                                 widen(gUTF8EntityTable8[4])};

uint8 decodeXmlEntity(const char* name, int length, bool windowsTable)
{
    if (length < 1)
        return 0;
    if (name[0] == '#' && length > 1 && name[1] == 'x')
        return decodeNumber(name + 2, length - 2, 16);
    if (name[0] == '#')
        return decodeNumber(name + 1, length - 1, 10);
    constexpr int kLongestName = 6;
    if (length > kLongestName)
        return 0;
    for (const FXmlEntity8& entity : windowsTable ? gEntityTable8Win : gEntityTable8Mac)
        if (isName(entity.name, name, static_cast<size_t>(length)))
            return entity.character;
    return 0;
}
