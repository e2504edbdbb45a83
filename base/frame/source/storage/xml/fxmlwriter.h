#pragma once

#include "containers/sequence/cmstack.h"
#include "containers/value/buffer.h"
#include "foundation/object/iptr.h"

#include <string_view>

class CmContainer;
class FStream;
class IBStream;

/// Writes tags and text as indented lines: a tab a level, each line ended by CR LF.
///
/// Operations with a result give 0 for success and 1 where a line could not be written or the tags don't nest.
/// One thread at a time.
class FXmlWriter
{
public:
    /// Bits of the flags.
    enum Flags
    {
        kOmitEmptyAttributes = 1,
        kEncodeValues = 2
    };

    /// Takes a reference on the stream; it may be null until `initialize`.
    FXmlWriter(FStream* stream, int flags);
    FXmlWriter(const FXmlWriter&) = delete;
    FXmlWriter& operator=(const FXmlWriter&) = delete;
    virtual ~FXmlWriter();

    /// Writes to another stream from now on, at depth 0. 2 where it is none of the framework's own.
    int32 initialize(IBStream* target);

    /// `attributes` holds FXmlAttribute objects; their texts are written in 8 bits.
    int32 writeStartTag(const char* name, CmContainer& attributes, bool isEmpty);
    int32 writeStartTag(const char* name, int count, const char** names, const char** values, bool isEmpty);
    /// 1, and nothing is written, where another tag or none is open.
    int32 writeEndTag(const char* name);
    /// Each line of the text becomes an indented line; a NUL ends it.
    int32 writeData(void* text, unsigned int count);
    /// The text is trimmed; nothing is written when nothing is left.
    int32 writeComment(const char* text);
    int32 newLine();
    /// Writes one line with `indent` tabs; an empty text writes nothing at all.
    virtual int32 outputLine(const char* text, int indent);

    /// Append a text to a buffer with entities in place of what markup needs, without a terminator.
    /// 16-bit text comes out in UTF-8.
    static void encodeString(Buffer& out, const char16* text);
    static void encodeString(Buffer& out, std::u16string_view text);
    /// With `utf8` the four characters of markup are named and all other bytes pass. Without, every character that
    /// the table of the older parser names for writing is, '$' and '^' among them, and a byte of 0x80 or more becomes
    /// a number.
    static void encodeString(Buffer& out, const char* text, bool utf8);

private:
    void beginLine(const char* name);
    void appendAttribute(const char* name, const char* value);
    int32 finishStartTag(const char* name, bool isEmpty);
    int32 flushLine(int indent);

    IPtr<FStream> stream;
    CmStack tagStack;
    int flags;
    Buffer line;
};
