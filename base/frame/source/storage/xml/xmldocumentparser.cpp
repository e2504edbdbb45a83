#include "storage/xml/xmldocumentparser.h"

#include "storage/xml/xmlcomment.h"
#include "storage/xml/xmlelementdata.h"
#include "storage/xml/xmltext.h"

#include <cstring>

namespace Xml
{
namespace
{
/// What a small block of memory costs beyond its bytes.
constexpr size_t kBlockCost = 16;

size_t wideCost(size_t length)
{
    return 2 * (length + 1) + kBlockCost;
}
} // namespace

DocumentParser::DocumentParser() : parser(adopt(new FXmlParser2)) {}

DocumentParser::~DocumentParser() = default;

bool DocumentParser::parse(IBStream* stream, int64 maxTreeBytes)
{
    bytesLeft = maxTreeBytes;
    // Only for the time of the parsing: two objects that hold each other would stay forever.
    parser->setHandler(this);
    const bool done = parser->process(stream);
    parser->setHandler(nullptr);
    return done && bytesLeft >= 0;
}

void DocumentParser::startTag(INewXmlParser* from, const char* tag, const char** attributes)
{
    if (finished)
        return;
    auto* element = new Element;
    const size_t textSize = element->setSource(tag, attributes);
    // As much as it takes when someone has asked for its texts.
    const auto count = static_cast<size_t>(element->countAttributes());
    charge(from,
           sizeof(Element) + kBlockCost + wideCost(textSize) + count * (sizeof(Attribute) + 3 * kBlockCost));
    if (current)
        current->linkBefore(element, nullptr);
    else
        root = adopt<Node>(element);
    current = element;
}

void DocumentParser::endTag(INewXmlParser*, const char*)
{
    if (finished || !current)
        return;
    Node* parent = current->parent;
    current = parent ? parent->asElement() : nullptr;
    finished = current == nullptr;
}

// No piece is joined with its neighbour: what reads the text relies on seeing the pieces.
void DocumentParser::charData(INewXmlParser* from, const char* data, int length)
{
    if (finished || !current)
        return;
    charge(from, sizeof(ElementData) + 2 * kBlockCost + static_cast<size_t>(length));
    auto* node = new ElementData;
    node->setSource({data, static_cast<size_t>(length)});
    current->linkBefore(node, nullptr);
}

void DocumentParser::comment(INewXmlParser* from, const char* text)
{
    if (finished || !current)
        return;
    charge(from, sizeof(Comment) + kBlockCost + wideCost(strlen(text)));
    auto* node = new Comment(ConstString());
    assignUtf8(node->name, std::string_view(text));
    current->linkBefore(node, nullptr);
}

void DocumentParser::charge(INewXmlParser* from, size_t bytes)
{
    bytesLeft -= static_cast<int64>(bytes);
    if (bytesLeft < 0)
        from->stop();
}
} // namespace Xml
