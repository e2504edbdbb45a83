#include "storage/xml/fxmlwriter.h"

#include "containers/sequence/cmiterator.h"
#include "foundation/text/cmstring.h"
#include "storage/stream/fstream.h"
#include "storage/xml/fxmlattribute.h"
#include "storage/xml/xmltext.h"

#include <algorithm>
#include <cstring>
#include <memory>
#include <string_view>

namespace
{
constexpr int32 kWritten = kResultOk;
constexpr int32 kNotWritten = 1;

bool writeAll(FStream& stream, const char* bytes, size_t count)
{
    return stream.writeRaw(bytes, static_cast<int64>(count)) == static_cast<int64>(count);
}
} // namespace

FXmlWriter::FXmlWriter(FStream* target, int writerFlags) : stream(target), flags(writerFlags)
{
    tagStack.takeElements();
}

FXmlWriter::~FXmlWriter() = default;

int32 FXmlWriter::initialize(IBStream* target)
{
    FStream* targetStream = toFStream(target);
    if (!targetStream)
        return kStreamInvalidArgument;
    stream = targetStream;
    tagStack.removeAll();
    return kWritten;
}

int32 FXmlWriter::writeStartTag(const char* name, CmContainer& attributes, bool isEmpty)
{
    beginLine(name);
    const std::unique_ptr<CmIterator> iterator(attributes.newIterator());
    while (!iterator->done())
        if (const auto* attribute = FCast(FXmlAttribute, iterator->next()))
            appendAttribute(attribute->name.text8(), attribute->value.text8());
    return finishStartTag(name, isEmpty);
}

int32 FXmlWriter::writeStartTag(const char* name, int count, const char** names, const char** values,
                                bool isEmpty)
{
    beginLine(name);
    for (int i = 0; i < count; i++)
        appendAttribute(names[i], values[i] ? values[i] : "");
    return finishStartTag(name, isEmpty);
}

void FXmlWriter::beginLine(const char* name)
{
    line.flush();
    line.put('<');
    Xml::appendText(line, name);
}

void FXmlWriter::appendAttribute(const char* name, const char* value)
{
    if ((flags & kOmitEmptyAttributes) && !*value)
        return;
    line.put(' ');
    Xml::appendText(line, name);
    line.put("=\"", 2);
    if (flags & kEncodeValues)
        encodeString(line, value, false);
    else
        Xml::appendText(line, value);
    line.put('"');
}

int32 FXmlWriter::finishStartTag(const char* name, bool isEmpty)
{
    const int depth = tagStack.total();
    Xml::appendText(line, isEmpty ? "/>" : ">");
    if (!isEmpty)
        tagStack.push(new CmString(name));
    return flushLine(depth);
}

int32 FXmlWriter::flushLine(int indent)
{
    line.put('\0');
    return outputLine(line.str8(), indent);
}

int32 FXmlWriter::writeEndTag(const char* name)
{
    const auto* open = static_cast<CmString*>(tagStack.peek());
    if (!open || strcmp(open->text8(), name) != 0)
        return kNotWritten;
    line.flush();
    line.put("</", 2);
    Xml::appendText(line, name);
    line.put('>');
    tagStack.pop()->release();
    return flushLine(tagStack.total());
}

int32 FXmlWriter::writeData(void* text, unsigned int count)
{
    const char* from = static_cast<const char*>(text);
    std::string_view rest(from, from ? strnlen(from, count) : 0);
    while (!rest.empty())
    {
        const std::string_view piece = rest.substr(0, rest.find('\n'));
        rest.remove_prefix(std::min(piece.size() + 1, rest.size()));
        line.flush();
        line.put(piece.data(), static_cast<uint32>(piece.size()));
        if (const int32 result = flushLine(tagStack.total()))
            return result;
    }
    return kWritten;
}

int32 FXmlWriter::writeComment(const char* text)
{
    FString trimmed(text);
    trimmed.trim();
    if (trimmed.isEmpty())
        return kWritten;
    line.flush();
    Xml::appendText(line, "<!-- ");
    Xml::appendText(line, trimmed.text8());
    Xml::appendText(line, " -->");
    return flushLine(tagStack.total());
}

int32 FXmlWriter::newLine()
{
    return stream && writeAll(*stream, "\r\n", 2) ? kWritten : kNotWritten;
}

int32 FXmlWriter::outputLine(const char* text, int indent)
{
    if (!text || !*text)
        return kWritten;
    if (!stream)
        return kNotWritten;
    for (int i = 0; i < indent; i++)
        if (!writeAll(*stream, "\t", 1))
            return kNotWritten;
    return writeAll(*stream, text, strlen(text)) ? newLine() : kNotWritten;
}
