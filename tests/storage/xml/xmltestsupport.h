#pragma once

#include "containers/sequence/cmcontainer.h"
#include "foundation/text/fstring.h"
#include "storage/stream/fmemorystream.h"
#include "storage/xml/fxmlattribute.h"
#include "storage/xml/fxmlparser.h"

#include <gtest/gtest.h>

#include <string>

/// A stream over a text, read from its start.
class TextStream : public FMemoryStream
{
public:
    explicit TextStream(const std::string& content)
    {
        writeRaw(content.data(), static_cast<int64>(content.size()));
        rewind();
    }
};

inline std::string contentOf(const FMemoryStream& stream)
{
    return std::string(static_cast<const char*>(stream.getData()), static_cast<size_t>(stream.getSize()));
}

inline std::string narrow(const ConstString& text)
{
    String copy(text);
    copy.toMultiByte(kEncodingUtf8);
    return copy.text8();
}

/// Writes down what the older parser tells: "<a b='1'>", "</a>", "[text]", "{comment}".
class RecordingParser : public FXmlParser
{
public:
    explicit RecordingParser(FStream& source, bool bufferIt = true) : FXmlParser(&source, bufferIt) {}

    bool startTag(const char* name, CmContainer& attributes, bool isEmpty, void*) override
    {
        record += std::string("<") + name;
        for (int i = 0; i < attributes.total(); i++)
        {
            auto* attribute = FCast(FXmlAttribute, attributes.at(i));
            record += " " + narrow(attribute->name) + "='" + narrow(attribute->value) + "'";
        }
        record += isEmpty ? "/>" : ">";
        return refusedTag != name;
    }
    bool endTag(const char* name, void*) override
    {
        record += std::string("</") + name + ">";
        return refusedTag != std::string("/") + name;
    }
    void gotData(void* bytes, unsigned int count, void*) override
    {
        pieces++;
        text.append(static_cast<char*>(bytes), count);
        if (count > 0)
            return;
        record += "[" + text + "]";
        text.clear();
    }
    void gotComment(const char* comment, void*, bool endOfComment) override
    {
        if (!inComment)
            record += "{";
        record += comment + std::string(endOfComment ? "}" : "|");
        inComment = !endOfComment;
    }

    std::string record;
    std::string text;
    std::string refusedTag;
    bool inComment = false;
    int pieces = 0;
};

/// What the older parser tells of a text, and the error's number behind it if there is one.
inline std::string told(const std::string& text, uint32 flags = 0, bool bufferIt = true)
{
    TextStream stream(text);
    RecordingParser parser(stream, bufferIt);
    parser.setFlags(flags);
    const bool done = parser.process(nullptr);
    EXPECT_EQ(done, parser.getError() == 0);
    return done ? parser.record : parser.record + "!" + std::to_string(parser.getError());
}

inline std::string repeated(const char* text, int count)
{
    std::string result;
    for (int i = 0; i < count; i++)
        result += text;
    return result;
}
