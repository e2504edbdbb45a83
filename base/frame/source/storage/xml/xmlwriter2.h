#pragma once

#include "containers/value/buffer.h"
#include "foundation/object/iptr.h"

class IBStream;

enum XmlStartTagType
{
    kOpenTag = 0,
    kEmptyTag = 1
};

/// The newer writer: puts a line together piece by piece and writes it with its indent, in UTF-8.
///
/// An element can be kept on a single line together with its text and its end tag. Operations with a result give 0
/// for success and 1 where the stream doesn't take the line. One thread at a time.
class XmlWriter2
{
public:
    /// Takes a reference on the stream.
    explicit XmlWriter2(IBStream* stream);
    XmlWriter2(const XmlWriter2&) = delete;
    XmlWriter2& operator=(const XmlWriter2&) = delete;
    ~XmlWriter2();

    /// No indent and no line end until `writeEndTag` closes the line.
    void setSingleLine(bool state) { singleLine = state; }
    bool isSingleLine() const { return singleLine; }
    /// Indent with three blanks a level instead of one tab.
    void setSpaceIndent(bool state) { spaceIndent = state; }
    int32 getDepth() const { return depth; }

    /// The declaration; with `utf8` it names the encoding, behind a byte order mark.
    int32 writeIntro(bool utf8);

    // Tags
    int32 writeStartTag(const char* name, XmlStartTagType type);
    /// Begins a tag; attributes follow, then `finishStartTag`.
    void beginStartTag(const char* name);
    void appendAttribute8(const char* name, const char* value);
    void appendAttribute16(const char* name, const char16* value);
    void appendIntAttribute(const char* name, int64 value);
    void appendUIntAttribute(const char* name, uint64 value);
    /// Fifty significant digits, so that any double comes back as it was.
    void appendFloatAttribute(const char* name, double value);
    int32 finishStartTag(XmlStartTagType type);
    /// Names are not checked. `endSingleLine` ends the single line, if one is being written.
    int32 writeEndTag(const char* name, bool endSingleLine);

    // Text, without a line end
    int32 writeString8(const char* text);
    int32 writeString16(const char16* text);
    int32 writeInt(int64 value);
    int32 writeFloat(double value);

    /// The text is not encoded and must not hold "-->".
    int32 writeComment8(const char* text);
    int32 writeComment16(const char16* text);
    int32 newLine();
    /// Writes what has been put together, `indent` levels deep; an empty line is not written. Begins a new line.
    int32 writeLine(int indent);

private:
    void beginAttribute(const char* name);
    int32 writePiece();
    int32 writeBytes(const void* bytes, unsigned count);

    IPtr<IBStream> stream;
    int32 depth = 0;
    Buffer line;
    bool singleLine = false;
    bool spaceIndent = false;
};
