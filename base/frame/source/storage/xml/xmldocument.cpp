#include "storage/xml/xmldocument.h"

#include "containers/value/buffer.h"
#include "storage/stream/ibstream.h"
#include "storage/xml/xmldocumentparser.h"

#include <cstring>

namespace Xml
{
namespace
{
constexpr char kIntro[] = "\xEF\xBB\xBF<?xml version=\"1.0\" encoding=\"utf-8\"?>\n";
} // namespace

Document::Document(Node* node) : root(node) {}

Element* Document::getRootElement() const
{
    return root ? root->asElement() : nullptr;
}

void Document::setRoot(Node* node)
{
    root = node;
}

bool Document::load(IBStream* stream)
{
    root = nullptr;
    IPtr<DocumentParser> parser = adopt(new DocumentParser);
    if (!parser->parse(stream, kMaxTreeBytes))
        return false;
    root = parser->getRoot();
    return root != nullptr;
}

bool Document::save(IBStream* stream, bool reformat)
{
    if (!stream || !root)
        return false;
    int written = 0;
    const auto count = static_cast<int>(strlen(kIntro));
    char intro[sizeof(kIntro)];
    memcpy(intro, kIntro, sizeof(kIntro));
    if (stream->write(intro, count, &written) != kResultOk || written != count)
        return false;
    if (Element* element = reformat ? getRootElement() : nullptr)
        element->reformat(0);
    return root->write(stream);
}
} // namespace Xml
