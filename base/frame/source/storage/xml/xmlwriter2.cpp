#include "storage/xml/xmlwriter2.h"

#include "storage/stream/ibstream.h"
#include "storage/xml/fxmlwriter.h"
#include "storage/xml/xmlnumber.h"
#include "storage/xml/xmltext.h"

#include <cstring>

XmlWriter2::XmlWriter2(IBStream* target) : stream(target) {}

XmlWriter2::~XmlWriter2() = default;

int32 XmlWriter2::writeIntro(bool utf8)
{
    line.flush();
    Xml::appendText(line, utf8 ? "\xEF\xBB\xBF<?xml version=\"1.0\" encoding=\"utf-8\"?>"
                               : "<?xml version=\"1.0\"?>");
    return writeLine(0);
}

int32 XmlWriter2::writeStartTag(const char* name, XmlStartTagType type)
{
    beginStartTag(name);
    return finishStartTag(type);
}

void XmlWriter2::beginStartTag(const char* name)
{
    line.flush();
    line.put('<');
    Xml::appendText(line, name);
}

void XmlWriter2::beginAttribute(const char* name)
{
    line.put(' ');
    Xml::appendText(line, name);
    line.put("=\"", 2);
}

void XmlWriter2::appendAttribute8(const char* name, const char* value)
{
    beginAttribute(name);
    FXmlWriter::encodeString(line, value ? value : "", true);
    line.put('"');
}

void XmlWriter2::appendAttribute16(const char* name, const char16* value)
{
    beginAttribute(name);
    FXmlWriter::encodeString(line, value);
    line.put('"');
}

void XmlWriter2::appendIntAttribute(const char* name, int64 value)
{
    beginAttribute(name);
    Xml::appendInt(line, value);
    line.put('"');
}

void XmlWriter2::appendUIntAttribute(const char* name, uint64 value)
{
    beginAttribute(name);
    Xml::appendUInt(line, value);
    line.put('"');
}

void XmlWriter2::appendFloatAttribute(const char* name, double value)
{
    beginAttribute(name);
    Xml::appendFloat(line, value);
    line.put('"');
}

int32 XmlWriter2::finishStartTag(XmlStartTagType type)
{
    Xml::appendText(line, type == kEmptyTag ? "/>" : ">");
    const int32 indent = depth;
    if (type != kEmptyTag)
        depth++;
    return writeLine(indent);
}

int32 XmlWriter2::writeEndTag(const char* name, bool endSingleLine)
{
    depth--;
    line.flush();
    line.put("</", 2);
    Xml::appendText(line, name);
    line.put('>');
    const bool endsLine = singleLine && endSingleLine;
    const int32 result = writeLine(singleLine ? 0 : depth);
    if (!endsLine)
        return result;
    singleLine = false;
    const int32 ended = newLine();
    return result != kResultOk ? result : ended;
}

int32 XmlWriter2::writeString8(const char* text)
{
    line.flush();
    FXmlWriter::encodeString(line, text ? text : "", true);
    return writePiece();
}

int32 XmlWriter2::writeString16(const char16* text)
{
    line.flush();
    FXmlWriter::encodeString(line, text);
    return writePiece();
}

int32 XmlWriter2::writeInt(int64 value)
{
    line.flush();
    Xml::appendInt(line, value);
    return writePiece();
}

int32 XmlWriter2::writeFloat(double value)
{
    line.flush();
    Xml::appendFloat(line, value);
    return writePiece();
}

int32 XmlWriter2::writeComment8(const char* text)
{
    line.flush();
    Xml::appendText(line, "<!-- ");
    Xml::appendText(line, text ? text : "");
    Xml::appendText(line, " -->");
    return writeLine(0);
}

int32 XmlWriter2::writeComment16(const char16* text)
{
    line.flush();
    Xml::appendText(line, "<!-- ");
    Xml::appendUtf8(line, text ? text : u"");
    Xml::appendText(line, " -->");
    return writeLine(0);
}

int32 XmlWriter2::newLine()
{
    return writeBytes("\r\n", 2);
}

int32 XmlWriter2::writeLine(int indent)
{
    if (line.getFillSize() == 0)
        return kResultOk;
    const char* unit = spaceIndent ? "   " : "\t";
    Buffer whole;
    for (int i = 0; i < indent; i++)
        Xml::appendText(whole, unit);
    whole.put(line.ptr(), line.getFillSize());
    if (!singleLine)
        whole.put("\r\n", 2);
    line.flush();
    return writeBytes(whole.ptr(), whole.getFillSize());
}

int32 XmlWriter2::writePiece()
{
    const int32 result = line.getFillSize() > 0 ? writeBytes(line.ptr(), line.getFillSize()) : kResultOk;
    line.flush();
    return result;
}

int32 XmlWriter2::writeBytes(const void* bytes, unsigned count)
{
    int written = 0;
    const bool done =
        stream && stream->write(const_cast<void*>(bytes), static_cast<int>(count), &written) == kResultOk &&
        written == static_cast<int>(count);
    return done ? kResultOk : kStreamFailed;
}
