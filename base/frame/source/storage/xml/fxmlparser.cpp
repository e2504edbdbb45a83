#include "storage/xml/fxmlparser.h"

#include "foundation/text/cmstring.h"
#include "storage/stream/fstream.h"
#include "storage/xml/fxmlattributelist.h"
#include "storage/xml/fxmlscan.h"
#include "storage/xml/fxmltokentext.h"
#include "storage/xml/xmlentities.h"
#include "storage/xml/xmltext.h"

#include <utility>

namespace
{
constexpr uint32 kBufferedBlock = 2048;

constexpr const char* kErrorMessages[] = {"",
                                          "Xml data malformed!",
                                          "Unexpected tag or invalid attributes!",
                                          "Unexpected end of file!",
                                          "Not enough actual attributes in tag!",
                                          "Unexpected Tag!"};

bool isTextEqual(const FString& text, const char* other)
{
    return !text.isWideString() && strcmp(text.text8(), other) == 0;
}
} // namespace

FXmlParser::FXmlParser(FStream* newStream, bool bufferIt)
    : stream(newStream),
      buffer((bufferIt ? kBufferedBlock : 1) + FXmlScan::kStep),
      blockSize(bufferIt ? kBufferedBlock : 1),
      tokenBuffer(kMaxToken + 1),
      tagName(kMaxToken + 1)
{
    tagStack.takeElements();
}

FXmlParser::~FXmlParser()
{
    attributePool.takeElements();
    attributePool.removeAll();
    spareNames.takeElements();
    spareNames.removeAll();
    tagStack.removeAll();
}

bool FXmlParser::startTag(const char*, CmContainer&, bool, void*)
{
    return true;
}

bool FXmlParser::endTag(const char*, void*)
{
    return true;
}

void FXmlParser::gotData(void*, unsigned int, void*) {}

void FXmlParser::gotComment(const char*, void*, bool) {}

void FXmlParser::setStream(FStream* newStream)
{
    stream = newStream;
    dropBuffer();
    line = 1;
    error = kNoError;
    stopRequested = false;
    codePage = 0;
    tagStack.removeAll();
}

const char16* FXmlParser::errorMessage() const
{
    const bool isKnown = error > 0 && error < static_cast<int32>(std::size(kErrorMessages));
    return ConstStringTable::instance().getString(kErrorMessages[isKnown ? error : 0]);
}

void FXmlParser::getErrorContext(FString& text) const
{
    text.printf("Line %d", line);
}

const char* FXmlParser::getCurrentStartTag() const
{
    const auto* name = static_cast<CmString*>(tagStack.peek());
    return name ? name->text8() : nullptr;
}

// The first error counts.
void FXmlParser::fail(Error code)
{
    if (error == kNoError)
        error = code;
}

bool FXmlParser::process(void* data)
{
    error = kNoError;
    stopRequested = false;
    const int startDepth = tagStack.total();
    while (error == kNoError && !stopRequested && processToken(startDepth, data))
    {
    }
    return error == kNoError;
}

bool FXmlParser::skip()
{
    const bool wasSkipping = skipping;
    skipping = true;
    const bool done = process(nullptr);
    skipping = wasSkipping;
    return done;
}

// False where `process` is to end.
bool FXmlParser::processToken(int startDepth, void* data)
{
    long long size = 0;
    skipLayout((flags & kKeepSpaces) != 0);
    if (isAtEndTag() && takePlainEndTag())
    {
        endElement(data);
        return !isElementDone(startDepth);
    }
    switch (nextToken(size))
    {
    case kEndOfData:
        if (!tagStack.isEmpty())
            fail(kErrorUnexpectedEnd);
        return false;
    case kLineEnd:
    case kSpace:
        break;
    case kStartTag:
        handleStartTag(data);
        return !((flags & kStopAfterMainTag) && tagStack.isEmpty());
    case kEndTag:
        handleEndTag(data);
        return !isElementDone(startDepth);
    case kData:
        handleData(size, data);
        break;
    case kInstruction:
        handlePI();
        break;
    case kCData:
        skipCData();
        break;
    case kDocType:
        skipDocType();
        break;
    case kComment:
        if ((flags & kReportComments) && !skipping)
            handleComment(data);
        else
            skipComment();
        break;
    default:
        fail(kErrorMalformed);
    }
    return true;
}

/// As `getNextToken`. Leaves the name of a start tag in `tagName`, since the attributes are read into the same buffer
/// as a token is.
FXmlParser::Token FXmlParser::nextToken(long long& size)
{
    if (takePlainTagName())
        return kStartTag;
    const Token kind = getNextToken(tokenBuffer.ptr(), &size, false);
    if (kind == kStartTag)
        strcpy(tagName.ptr(), tokenBuffer.ptr() + 1);
    return kind;
}

// So a nested call reads exactly the element whose start has been told.
bool FXmlParser::isElementDone(int startDepth) const
{
    const int depth = tagStack.total();
    return depth == startDepth - 1 || ((flags & kStopAfterMainTag) && depth == 0);
}

void FXmlParser::handlePI()
{
    FXmlAttributeList attributes;
    Token ending = kMalformed;
    if (!readAttributes(attributes, ending) || ending != kInstructionEnd)
        fail(kErrorMalformed);
    for (int i = 0; i < attributes.total(); i++)
    {
        const FXmlAttribute* attribute = attributes.attributeAt(i);
        if (isTextEqual(attribute->name, "encoding") && isTextEqual(attribute->value, "utf-8"))
            codePage = kEncodingUtf8;
    }
    recycle(attributes);
}

void FXmlParser::removeEntities(char* text, bool* sawHighBit, bool windowsTable)
{
    if (text)
        text[decodeReferences(text, text, sawHighBit, windowsTable)] = 0;
}

/// Writes the decoded text, not terminated, to `target`, which may lie at the text itself, in front of it or elsewhere.
/// Gives its length. Each '&' is looked at once; the next ';' is looked for only when the last one found has been passed.
size_t FXmlParser::decodeReferences(std::string_view text, char* target, bool* sawHighBit, bool windowsTable)
{
    const char* from = text.data();
    const char* const end = from + text.size();
    const auto find = [end](const char* begin, char c)
    { return static_cast<const char*>(memchr(begin, c, static_cast<size_t>(end - begin))); };

    char* to = target;
    const char* reference = find(from, '&');
    const char* semicolon = reference;
    while (reference && semicolon)
    {
        if (semicolon <= reference)
            semicolon = find(reference, ';');
        const int length = semicolon ? static_cast<int>(semicolon - reference) - 1 : 0;
        const uint8 character = decodeXmlEntity(reference + 1, length, windowsTable);
        memmove(to, from, static_cast<size_t>(reference - from));
        to += reference - from;
        *to++ = character ? static_cast<char>(character) : '&';
        if (sawHighBit && character >= 0x80)
            *sawHighBit = true;
        from = character ? semicolon + 1 : reference + 1;
        reference = find(from, '&');
    }
    memmove(to, from, static_cast<size_t>(end - from));
    return static_cast<size_t>(to - target + (end - from));
}
