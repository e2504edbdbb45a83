#include "storage/xml/xmlcomment.h"

#include "containers/value/buffer.h"
#include "storage/xml/xmltext.h"

namespace Xml
{
Comment::Comment(const ConstString& text) : Node(text) {}

void Comment::print(Buffer& out) const
{
    out.put("<!--", 4);
    appendUtf8(out, viewOf(name));
    out.put("-->", 3);
}
} // namespace Xml
