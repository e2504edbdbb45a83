#include "storage/xml/xmlattribute.h"

#include "containers/value/buffer.h"
#include "storage/xml/fxmlwriter.h"
#include "storage/xml/xmltext.h"

namespace Xml
{
Attribute::Attribute(const ConstString& attributeName, const ConstString& text)
    : Node(attributeName),
      value(text)
{
    value.toWideString();
}

void Attribute::setValue(const ConstString& text)
{
    widen();
    value = text;
    value.toWideString();
}

bool Attribute::isNamed(const char16* text) const
{
    return source.isEmpty() ? name == text : isEqualText(source.first(), text);
}

void Attribute::setSource(std::string_view sourceName, std::string_view sourceValue)
{
    if (source.set(sourceName, sourceValue) && !source.isAscii())
        widen();
}

void Attribute::widen() const
{
    if (source.isEmpty())
        return;
    assignUtf8(name, source.first());
    assignUtf8(value, source.second());
    source.drop();
}

void Attribute::print(Buffer& out) const
{
    if (!source.isEmpty() && source.isPlain())
        return printPlain(out);
    printText(out, source.first(), name);
    out.put("=\"", 2);
    printText(out, source.second(), value);
    out.put('"');
}

void Attribute::printPlain(Buffer& out) const
{
    const std::string_view sourceName = source.first();
    const std::string_view sourceValue = source.second();
    char* to = extend(out, sourceName.size() + sourceValue.size() + 3);
    if (!to)
        return;
    to = copyText(to, sourceName);
    *to++ = '=';
    *to++ = '"';
    *copyText(to, sourceValue) = '"';
}

void Attribute::printText(Buffer& out, std::string_view ascii, const FString& text) const
{
    if (source.isEmpty())
        FXmlWriter::encodeString(out, viewOf(text));
    else
        FXmlWriter::encodeString(out, ascii.data(), true);
}
} // namespace Xml
