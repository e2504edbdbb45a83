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
    value = text;
    value.toWideString();
}

void Attribute::print(Buffer& out) const
{
    FXmlWriter::encodeString(out, viewOf(name));
    out.put("=\"", 2);
    FXmlWriter::encodeString(out, viewOf(value));
    out.put('"');
}
} // namespace Xml
