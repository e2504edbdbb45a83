#pragma once

#include "containers/value/buffer.h"
#include "storage/xml/xmlnode.h"
#include "storage/xml/xmlsourcetext.h"

namespace Xml
{
/// A piece of text between tags, raw in UTF-8 and without entities.
///
/// A parsed document has one for every piece that the tokenizer delivers: line ends, entities and block ends part
/// a text into several. One thread at a time.
class ElementData : public Node
{
    DECLARE_TYPE(ElementData, Node)

    ElementData() = default;
    /// As `setData`.
    ElementData(const void* bytes, int length);

    /// Takes a copy of the bytes. False, with the text empty, where there is no memory for it.
    bool setData(const void* bytes, int length);
    /// The text with its terminator; "" when empty.
    const char* getData() const;
    /// The count of bytes without the terminator.
    int getLength() const;
    /// Whether the text consists of tabs, line ends and blanks alone, as what lays out a file does.
    bool isFormatData() const;

    ElementData* asData() override { return this; }

protected:
    void print(Buffer& out) const override;

private:
    friend class DocumentParser;

    /// Takes the text as the parser gave it. False where there is no memory.
    bool setSource(std::string_view text) { return source.set(text); }

    /// Empty while `source` isn't.
    Buffer data;
    SourceText source;
};
} // namespace Xml
