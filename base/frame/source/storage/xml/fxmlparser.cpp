#include "storage/xml/fxmlparser.h"

#include "foundation/text/cmstring.h"
#include "storage/stream/fstream.h"
#include "storage/xml/fxmlattribute.h"
#include "storage/xml/fxmltokentext.h"
#include "storage/xml/xmlentities.h"
#include "storage/xml/xmltext.h"

#include <algorithm>
#include <array>
#include <string_view>

namespace
{
constexpr uint32 kBufferedBlock = 2048;

constexpr const char* kErrorMessages[] = {"",
                                          "Xml data malformed!",
                                          "Unexpected tag or invalid attributes!",
                                          "Unexpected end of file!",
                                          "Not enough actual attributes in tag!",
                                          "Unexpected Tag!"};

using ByteSet = std::array<bool, 256>;

constexpr ByteSet makeSet(std::string_view bytes)
{
    ByteSet set{};
    for (const char c : bytes)
        set[static_cast<uint8>(c)] = true;
    return set;
}

/// The bytes that end a name, or may mean something else than themselves in a value.
constexpr ByteSet kNameEnds = makeSet({"\0\t\n\r \"&'/<=>?\\", 14});
constexpr ByteSet kValueEnds = makeSet({"\0\n\r\"&'\\", 7});

const char* findByte(const char* begin, const char* limit, const ByteSet& set)
{
    while (begin < limit && !set[static_cast<uint8>(*begin)])
        begin++;
    return begin;
}

bool isTextEqual(const FString& text, const char* other)
{
    return !text.isWideString() && strcmp(text.text8(), other) == 0;
}
} // namespace

FXmlParser::FXmlParser(FStream* newStream, bool bufferIt)
    : stream(newStream),
      buffer(bufferIt ? kBufferedBlock : 1),
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
    buffer.setFillSize(0);
    bufferPos = 0;
    lookAhead = 0;
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
    skipLayout();
    switch (getNextToken(tokenBuffer.ptr(), &size, false))
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

// So a nested call reads exactly the element whose start has been told.
bool FXmlParser::isElementDone(int startDepth) const
{
    const int depth = tagStack.total();
    return depth == startDepth - 1 || ((flags & kStopAfterMainTag) && depth == 0);
}

void FXmlParser::handleStartTag(void* data)
{
    // The attributes are read into the same buffer as the name was.
    strcpy(tagName.ptr(), tokenBuffer.ptr() + 1);
    CmArray attributes(0, 10);
    Token ending = kMalformed;
    if (readAttributes(attributes, ending) && (ending == kEmptyTagEnd || ending == kTagEnd))
        tellStartTag(attributes, ending == kEmptyTagEnd, data);
    else
        fail(kErrorMalformed);
    recycle(attributes);
}

// Reads to the first token that is no attribute. False where an attribute is refused.
bool FXmlParser::readAttributes(CmArray& attributes, Token& ending)
{
    while (true)
    {
        long long size = 0;
        skipBlanks();
        if (FXmlAttribute* plain = takePlainAttribute())
        {
            attributes.add(plain);
            continue;
        }
        ending = getNextToken(tokenBuffer.ptr(), &size, true);
        if (ending == kLineEnd || ending == kSpace)
            continue;
        if (ending != kAttribute)
            return true;
        FXmlAttribute* attribute = tokenToAttribute(tokenBuffer.ptr(), size);
        if (!attribute)
            return false;
        attributes.add(attribute);
    }
}

void FXmlParser::tellStartTag(CmArray& attributes, bool isEmpty, void* data)
{
    IPtr<CmString> name;
    const char* text = tagName.ptr();
    if (!isEmpty)
    {
        if (tagStack.total() >= kMaxDepth)
            return fail(kErrorMalformed);
        name = adopt(new CmString(text));
        text = name->text8();
        name->addRef();
        tagStack.push(name);
    }
    if (!skipping && !startTag(text, attributes, isEmpty, data))
        fail(kErrorUnexpectedTag);
}

void FXmlParser::handleEndTag(void* data)
{
    const auto name = adopt(static_cast<CmString*>(tagStack.pop()));
    // The text behind the stored name, if it goes on, isn't looked at.
    if (!name || strncmp(tokenBuffer.ptr() + 2, name->text8(), name->length()) != 0)
        return fail(kErrorMalformed);
    if (!skipping && !endTag(name->text8(), data))
        fail(kErrorUnexpectedTag);
}

void FXmlParser::handlePI()
{
    CmArray attributes(0, 10);
    Token ending = kMalformed;
    if (!readAttributes(attributes, ending) || ending != kInstructionEnd)
        fail(kErrorMalformed);
    for (int i = 0; i < attributes.total(); i++)
    {
        const auto* attribute = static_cast<FXmlAttribute*>(attributes.at(i));
        if (isTextEqual(attribute->name, "encoding") && isTextEqual(attribute->value, "utf-8"))
            codePage = kEncodingUtf8;
    }
    recycle(attributes);
}

/// Most attributes lie whole in the buffer and hold nothing that means something else: name="value". They are taken
/// from where they lie. Null, with nothing read, for any other, which then goes the way of all tokens.
FXmlAttribute* FXmlParser::takePlainAttribute()
{
    const char* const name = buffer + bufferPos;
    const char* const limit = buffer + buffer.getFillSize();
    const char* const equals = findByte(name, limit, kNameEnds);
    if (equals == name || limit - equals < 2 || *equals != '=' || (equals[1] != '"' && equals[1] != '\''))
        return nullptr;
    const char* const value = equals + 2;
    const char* const end = findByte(value, limit, kValueEnds);
    if (end == limit || *end != equals[1] || equals - name > kMaxAttributeName ||
        end - value > kMaxAttributeValue)
        return nullptr;
    bufferPos += static_cast<uint32>(end + 1 - name);
    lastLineEnd = 0;
    return makeAttribute(name, static_cast<int>(equals - name), value, static_cast<int>(end - value));
}

FXmlAttribute* FXmlParser::makeAttribute(const char* name, int nameLength, const char* value, int valueLength)
{
    FXmlAttribute* attribute = takeAttribute();
    attribute->name.assign(name, nameLength, false);
    attribute->value.assign(value, valueLength, false);
    return attribute;
}

// Gives null where the token is none. The attribute's reference is the caller's until `recycle`.
FXmlAttribute* FXmlParser::tokenToAttribute(char* token, int64 size)
{
    char* const end = token + size;
    char* nameEnd = token;
    while (nameEnd < end && *nameEnd != 0 && *nameEnd != '=' && !Xml::isXmlSpace(*nameEnd))
        nameEnd++;
    char* equals = nameEnd;
    while (equals < end && Xml::isXmlSpace(*equals))
        equals++;
    char* value = equals + 2;
    auto length = static_cast<int>(end - 1 - value);
    if (nameEnd - token > kMaxAttributeName || value >= end || *equals != '=' || length > kMaxAttributeValue)
        return nullptr;
    end[-1] = 0;

    bool sawHighBit = false;
    if (memchr(value, '&', static_cast<size_t>(length)))
    {
        removeEntities(value, &sawHighBit, (flags & kWindowsEntities) != 0);
        length = static_cast<int>(strlen(value));
    }
    FXmlAttribute* attribute = makeAttribute(token, static_cast<int>(nameEnd - token), value, length);
    if (sawHighBit && (flags & kWidenValues))
        attribute->value.toWideString(codePage);
    return attribute;
}

FXmlAttribute* FXmlParser::takeAttribute()
{
    const int last = attributePool.total() - 1;
    if (last < 0)
        return new FXmlAttribute;
    auto* attribute = static_cast<FXmlAttribute*>(attributePool.at(last));
    attributePool.removeAt(last);
    return attribute;
}

// In such an order that the next tag's first attribute gets the object of this one's: its texts have often the size
// that is needed again.
void FXmlParser::recycle(CmArray& attributes)
{
    for (int i = attributes.total() - 1; i >= 0; i--)
        if (!attributePool.add(attributes.at(i)))
            attributes.at(i)->release();
}

// Each '&' is looked at once; the next ';' is looked for only when the last one found has been passed.
void FXmlParser::removeEntities(char* text, bool* sawHighBit, bool windowsTable)
{
    char* from = text ? strchr(text, '&') : nullptr;
    char* semicolon = from;
    for (char* to = from; from; to++)
    {
        if (*from == '&' && semicolon && semicolon <= from)
            semicolon = strchr(from, ';');
        uint8 character = 0;
        if (*from == '&' && semicolon)
            character = decodeXmlEntity(from + 1, static_cast<int>(semicolon - from) - 1, windowsTable);
        *to = character ? static_cast<char>(character) : *from;
        if (sawHighBit && character >= 0x80)
            *sawHighBit = true;
        if (!character && *from == 0)
            return;
        from = character ? semicolon + 1 : from + 1;
    }
}
