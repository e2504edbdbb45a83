#include "storage/xml/xmlnode.h"

#include "containers/value/buffer.h"
#include "storage/stream/ibstream.h"
#include "storage/xml/xmlelement.h"

namespace Xml
{
Node::Node(const ConstString& text) : name(text)
{
    name.toWideString();
}

Node::Node(const Node& other) : FObject(other), name(other.name) {}

void Node::setName(const ConstString& text)
{
    widen();
    name = text;
    name.toWideString();
}

bool Node::write(IBStream* stream) const
{
    if (!stream)
        return false;
    Buffer out;
    print(out);
    return writeBuffer(out, *stream);
}

Element* Node::nextElement(const char16* elementName) const
{
    return findElement(next, elementName);
}

Element* Node::findElement(Node* from, const char16* elementName)
{
    for (Node* node = from; node; node = node->next)
    {
        Element* element = node->asElement();
        if (element && (!elementName || element->isNamed(elementName)))
            return element;
    }
    return nullptr;
}

bool Node::writeBuffer(Buffer& out, IBStream& stream)
{
    const auto count = static_cast<int>(out.getFillSize());
    int written = 0;
    const bool done =
        count == 0 || (stream.write(out.ptr(), count, &written) == kResultOk && written == count);
    out.flush();
    return done;
}
} // namespace Xml
