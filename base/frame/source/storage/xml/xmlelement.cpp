#include "storage/xml/xmlelement.h"

#include "containers/value/buffer.h"
#include "storage/xml/fxmlwriter.h"
#include "storage/xml/xmlcomment.h"
#include "storage/xml/xmlelementdata.h"
#include "storage/xml/xmltext.h"

#include <cstring>

namespace Xml
{
namespace
{
/// What is put together before it goes to the stream.
constexpr uint32 kWriteBlock = 32768;
} // namespace

Element::Element(const ConstString& elementName, Node* elementParent)
    : Node(elementName),
      parent(elementParent),
      attributes(0, 4)
{
}

Element::~Element()
{
    dropChildren();
}

bool Element::isNamed(const char16* text) const
{
    return source.isEmpty() ? name == text : isEqualText(source.begin(), text);
}

size_t Element::setSource(const char* tag, const char** tagAttributes)
{
    if (!source.set(tag, tagAttributes))
        return 0;
    const size_t size = source.size();
    if (!source.isAscii())
        widen();
    return size;
}

void Element::widen() const
{
    if (source.isEmpty())
        return;
    std::string_view text = source.begin();
    const auto nextText = [&text] { return text = std::string_view(text.data() + text.size() + 1); };
    assignUtf8(name, text);
    attributes.resize(static_cast<int>(source.countAttributes()));
    for (uint32 i = 0; i < source.countAttributes(); i++)
    {
        const auto attribute = adopt(new Attribute);
        assignUtf8(attribute->name, nextText());
        assignUtf8(attribute->value, nextText());
        attributes.add(attribute);
    }
    source.drop();
}

const TArray<IPtr<Attribute>>& Element::attributeList() const
{
    widen();
    return attributes;
}

// The children of those children that go with this element are taken over, so that no destructor calls another one
// deeper down.
void Element::dropChildren()
{
    while (Node* child = first)
    {
        unlink(child);
        Element* element = child->asElement();
        if (element && element->getRefCount() == 1)
            takeChildrenOf(*element);
        child->release();
    }
}

void Element::takeChildrenOf(Element& other)
{
    if (!other.first)
        return;
    other.last->next = first;
    if (first)
        first->previous = other.last;
    else
        last = other.last;
    first = other.first;
    childCount += other.childCount;
    other.first = other.last = nullptr;
    other.childCount = 0;
}

bool Element::addChild(Node* child)
{
    return insertChildAt(child, childCount);
}

bool Element::insertChildAt(Node* child, int index)
{
    if (index < 0 || index > childCount || !canAdopt(child))
        return false;
    child->addRef();
    linkBefore(child, index == childCount ? nullptr : childAt(index));
    return true;
}

bool Element::canAdopt(Node* child) const
{
    if (!child || child->linked || child->isTypeOf("Attribute", true))
        return false;
    Element* element = child->asElement();
    if (!element)
        return true;
    if (element == this)
        return false;
    for (Node* ancestor = element->first ? parent : nullptr; ancestor;)
    {
        if (ancestor == element)
            return false;
        Element* outer = ancestor->asElement();
        ancestor = outer ? outer->parent : nullptr;
    }
    return true;
}

void Element::linkBefore(Node* child, Node* place)
{
    Node* before = place ? place->previous : last;
    child->previous = before;
    child->next = place;
    (before ? before->next : first) = child;
    (place ? place->previous : last) = child;
    child->linked = true;
    childCount++;
    if (Element* element = child->asElement())
        element->parent = this;
}

void Element::unlink(Node* child)
{
    (child->previous ? child->previous->next : first) = child->next;
    (child->next ? child->next->previous : last) = child->previous;
    child->next = child->previous = nullptr;
    child->linked = false;
    childCount--;
    if (Element* element = child->asElement())
        element->parent = nullptr;
}

bool Element::removeChild(Node* child)
{
    for (Node* node = first; node; node = node->next)
    {
        if (node != child)
            continue;
        unlink(child);
        child->release();
        return true;
    }
    return false;
}

bool Element::removeChildAt(int index)
{
    Node* child = childAt(index);
    if (!child)
        return false;
    unlink(child);
    child->release();
    return true;
}

Node* Element::childAt(int index) const
{
    if (index < 0 || index >= childCount)
        return nullptr;
    Node* node = first;
    for (int i = 0; i < index; i++)
        node = node->next;
    return node;
}

Element* Element::firstElement(const char16* elementName) const
{
    return findElement(first, elementName);
}

bool Element::addAttribute(Attribute* attribute)
{
    widen();
    return attribute && attributes.add(attribute);
}

bool Element::removeAttribute(Attribute* attribute)
{
    widen();
    return attributes.remove(attribute);
}

Attribute* Element::getAttribute(const char16* attributeName) const
{
    if (!attributeName)
        return nullptr;
    for (const IPtr<Attribute>& attribute : attributeList())
        if (attribute->getName() == attributeName)
            return attribute;
    return nullptr;
}

Attribute* Element::attributeAt(int index) const
{
    return attributeList().at(index);
}

int Element::countAttributes() const
{
    return source.isEmpty() ? attributes.total() : static_cast<int>(source.countAttributes());
}

// The pieces are judged one by one, as the tokenizer cut them: a line end between two lines is a piece of its own
// and white space alone, so it is dropped.
bool Element::getStringData(String& text) const
{
    Buffer joined;
    for (Node* node = first; node; node = node->next)
    {
        const ElementData* data = node->asData();
        if (data && !data->isFormatData())
            joined.put(data->getData(), static_cast<uint32>(data->getLength()));
    }
    String result;
    if (joined.getFillSize() > 0)
        result.assign(joined.ptr(), static_cast<int>(joined.getFillSize()), false);
    result.trim();
    result.toWideString(kEncodingUtf8);
    text.append(result);
    return !text.isEmpty();
}

void Element::reformat(int depth)
{
    Element* element = this;
    while (true)
    {
        element->reformatChildren(depth);
        if (Element* inner = element->firstElement())
        {
            element = inner;
            depth++;
            continue;
        }
        while (element != this && !element->nextElement())
        {
            element = element->parent->asElement();
            depth--;
        }
        if (element == this)
            return;
        element = element->nextElement();
    }
}

void Element::reformatChildren(int depth)
{
    bool reformatted = false;
    for (Node* node = first; node;)
    {
        Node* following = node->next;
        const ElementData* data = node->asData();
        if (!data)
            insertLayout(node, depth + 1);
        else if (data->isFormatData())
        {
            unlink(node);
            node->release();
            reformatted = true;
        }
        else
            reformatted = false;
        node = following;
    }
    if (reformatted)
        insertLayout(nullptr, depth);
}

void Element::insertLayout(Node* place, int tabs)
{
    Buffer text(static_cast<uint32>(tabs) + 1, '\t');
    if (!text.ptr())
        return;
    text.ptr()[0] = '\n';
    linkBefore(new ElementData(text.ptr(), tabs + 1), place);
}

bool Element::write(IBStream* stream) const
{
    if (!stream)
        return false;
    Buffer out(kWriteBlock);
    out.setDelta(kWriteBlock);
    return printTree(out, stream) && writeBuffer(out, *stream);
}

void Element::print(Buffer& out) const
{
    printTree(out, nullptr);
}

// With a stream the buffer is written whenever it is full.
bool Element::printTree(Buffer& out, IBStream* stream) const
{
    const Element* open = this;
    open->printStart(out);
    for (Node* node = first; open;)
    {
        Element* element = node ? node->asElement() : nullptr;
        if (element)
        {
            element->printStart(out);
            open = element->first ? element : open;
            node = element->first ? element->first : element->next;
        }
        else if (node)
        {
            node->print(out);
            node = node->next;
        }
        else
        {
            open->printEnd(out);
            node = open->next;
            open = open == this ? nullptr : open->parent->asElement();
        }
        if (stream && out.getFillSize() >= kWriteBlock && !writeBuffer(out, *stream))
            return false;
    }
    return true;
}

void Element::printStart(Buffer& out) const
{
    out.put('<');
    if (source.isEmpty())
        appendUtf8(out, viewOf(name));
    else
        printSource(out);
    for (const IPtr<Attribute>& attribute : attributes)
    {
        out.put(' ');
        attribute->print(out);
    }
    if (first)
        out.put('>');
    else
        out.put("/>", 2);
}

void Element::printEnd(Buffer& out) const
{
    if (!first)
        return;
    out.put("</", 2);
    if (source.isEmpty())
        appendUtf8(out, viewOf(name));
    else
        appendText(out, source.begin());
    out.put('>');
}

/// The tag's name and attributes.
void Element::printSource(Buffer& out) const
{
    if (source.isPlain())
        return printPlainSource(out);
    std::string_view text = source.begin();
    const auto appendNext = [this, &out, &text]
    {
        text = std::string_view(text.data() + text.size() + 1);
        if (source.isPlain(text))
            out.put(text.data(), static_cast<uint32>(text.size()));
        else
            FXmlWriter::encodeString(out, text.data(), true);
    };
    out.put(text.data(), static_cast<uint32>(text.size()));
    for (uint32 i = 0; i < source.countAttributes(); i++)
    {
        out.put(' ');
        appendNext();
        out.put("=\"", 2);
        appendNext();
        out.put('"');
    }
}

// Each text loses its terminator; an attribute gets four characters around its two.
void Element::printPlainSource(Buffer& out) const
{
    const uint32 before = out.getFillSize();
    if (!out.setFillSize(before + source.size() - 1 + 2 * source.countAttributes()))
        return;
    const char* from = source.begin();
    char* to = out + before;
    const auto copy = [&from, &to]
    {
        const size_t length = strlen(from);
        memcpy(to, from, length);
        from += length + 1;
        to += length;
    };
    copy();
    for (uint32 i = source.countAttributes(); i > 0; i--)
    {
        *to++ = ' ';
        copy();
        *to++ = '=';
        *to++ = '"';
        copy();
        *to++ = '"';
    }
}
} // namespace Xml
