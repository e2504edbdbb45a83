#include "foundation/text/cmstring.h"
#include "storage/xml/fxmlparser.h"
#include "storage/xml/xmltext.h"

#include <algorithm>
#include <bit>
#include <cstring>
#include <string_view>
#include <utility>

// Tags and attributes of the older parser. Most lie whole in the buffer and hold nothing that means something else;
// they are taken from where they lie. All others go the way of all tokens.

namespace
{
/// The place in memory of the first byte that isn't 0.
unsigned firstSet(uint64 bytes)
{
    const int bits =
        std::endian::native == std::endian::little ? std::countr_zero(bytes) : std::countl_zero(bytes);
    return static_cast<unsigned>(bits) / 8;
}

/// The first byte that `isEnd` tells; `limit` where there is none. Sixteen bytes are asked together, without a test
/// between them, which fits in wide registers.
template <class Predicate>
const char* findEnd(const char* begin, const char* limit, Predicate isEnd)
{
    constexpr int kHalf = sizeof(uint64);
    for (; limit - begin >= 2 * kHalf; begin += 2 * kHalf)
    {
        uint8 ends[2 * kHalf];
        for (int i = 0; i < 2 * kHalf; i++)
            ends[i] = isEnd(static_cast<uint8>(begin[i]));
        uint64 halves[2];
        memcpy(halves, ends, sizeof(ends));
        if (halves[0] != 0)
            return begin + firstSet(halves[0]);
        if (halves[1] != 0)
            return begin + kHalf + firstSet(halves[1]);
    }
    while (begin < limit && !isEnd(static_cast<uint8>(*begin)))
        begin++;
    return begin;
}

// Calculated without conditions, so that they fit in wide registers.

/// Whether it ends the name of a tag or is one of those that a name doesn't have.
constexpr auto endsTagName = [](uint8 c) -> uint8
{
    const auto fromSlash = static_cast<uint8>(c ^ '/');
    const auto fromEnd = static_cast<uint8>(c ^ '>');
    return (c <= ' ') | (std::min(fromSlash, fromEnd) == 0);
};

/// Whether it ends the name of an attribute or is one of those that a name doesn't have.
constexpr auto endsName = [](uint8 c) -> uint8 { return (c <= ' ') | (c == '='); };

/// Whether it may end a value, or mean something else than itself there. '&' and ''' differ in the lowest bit alone.
constexpr auto endsValue = [](uint8 c) -> uint8
{
    const auto fromQuote = static_cast<uint8>(c ^ '"');
    const auto fromBackslash = static_cast<uint8>(c ^ '\\');
    const auto fromReference = static_cast<uint8>((c & 0xFE) ^ '&');
    return (c < ' ') | (std::min(std::min(fromQuote, fromBackslash), fromReference) == 0);
};
} // namespace

// Tags

// A handler may call `process`, so the list is out of reach while it is in use.
void FXmlParser::handleStartTag(void* data)
{
    auto attributes = std::move(spareAttributes);
    if (!attributes)
        attributes = adopt(new FXmlAttributeList);
    Token ending = kMalformed;
    if (readAttributes(*attributes, ending) && (ending == kEmptyTagEnd || ending == kTagEnd))
        tellStartTag(*attributes, ending == kEmptyTagEnd, data);
    else
        fail(kErrorMalformed);
    recycle(*attributes);
    spareAttributes = std::move(attributes);
}

void FXmlParser::tellStartTag(FXmlAttributeList& attributes, bool isEmpty, void* data)
{
    if (!isEmpty && tagStack.total() >= kMaxDepth)
        return fail(kErrorMalformed);
    IPtr<CmString> name;
    if (!isEmpty)
    {
        name = adopt(newTagName());
        name->addRef();
        tagStack.push(name);
    }
    if (!skipping && !startTag(name ? name->text8() : tagName.ptr(), attributes, isEmpty, data))
        fail(kErrorUnexpectedTag);
}

// The last closed element's object again, unless a handler is still looking at that name.
CmString* FXmlParser::newTagName()
{
    if (!spareName || spareName->getRefCount() > 1)
        return new CmString(tagName.ptr());
    spareName->assign(tagName.ptr());
    return spareName.take();
}

void FXmlParser::handleEndTag(void* data)
{
    // The text behind the stored name, if it goes on, isn't looked at.
    const auto* name = static_cast<CmString*>(tagStack.peek());
    if (!name || strncmp(tokenBuffer.ptr() + 2, name->text8(), name->length()) != 0)
        fail(kErrorMalformed);
    endElement(data);
}

void FXmlParser::endElement(void* data)
{
    auto name = adopt(static_cast<CmString*>(tagStack.pop()));
    if (error == kNoError && !skipping && !endTag(name->text8(), data))
        fail(kErrorUnexpectedTag);
    spareName = std::move(name);
}

/// The start of a tag up to its attributes; leaves its name in `tagName`.
bool FXmlParser::takePlainTagName()
{
    const char* const begin = buffer + bufferPos;
    const char* const limit = buffer + buffer.getFillSize();
    if (limit - begin < 2 || begin[0] != '<' || begin[1] == '!' || begin[1] == '/' || begin[1] == '?')
        return false;
    const char* const end = findEnd(begin + 1, limit, endsTagName);
    const bool isEnd = end < limit && (Xml::isXmlSpace(*end) || *end == '/' || *end == '>');
    if (!isEnd || end - begin > kMaxToken)
        return false;
    const auto length = static_cast<size_t>(end - begin - 1);
    memcpy(tagName.ptr(), begin + 1, length);
    tagName.ptr()[length] = 0;
    passPlain(end);
    return true;
}

/// The '>' or '/>' behind the attributes.
bool FXmlParser::takePlainTagEnd(Token& ending)
{
    const char* const begin = buffer + bufferPos;
    const char* const limit = buffer + buffer.getFillSize();
    const bool isEmpty = limit - begin > 1 && begin[0] == '/' && begin[1] == '>';
    if (!isEmpty && (begin == limit || begin[0] != '>'))
        return false;
    ending = isEmpty ? kEmptyTagEnd : kTagEnd;
    passPlain(begin + (isEmpty ? 2 : 1));
    return true;
}

/// The end of the innermost element.
bool FXmlParser::takePlainEndTag()
{
    const char* const begin = buffer + bufferPos;
    const char* const limit = buffer + buffer.getFillSize();
    if (limit - begin < 3 || begin[0] != '<' || begin[1] != '/')
        return false;
    const auto* name = static_cast<CmString*>(tagStack.peek());
    if (!name)
        return false;
    const char* const end = begin + 2 + name->length();
    if (limit <= end || *end != '>' || memcmp(begin + 2, name->text8(), name->length()) != 0)
        return false;
    passPlain(end + 1);
    return true;
}

void FXmlParser::passPlain(const char* end)
{
    bufferPos = static_cast<uint32>(end - buffer.ptr());
    lastLineEnd = 0;
}

// Attributes

// Reads to the first token that is no attribute. False where an attribute is refused.
bool FXmlParser::readAttributes(FXmlAttributeList& attributes, Token& ending)
{
    while (true)
    {
        takePlainAttributes(attributes);
        if (takePlainTagEnd(ending))
            return true;
        skipLayout(false);
        if (takePlainTagEnd(ending))
            return true;
        long long size = 0;
        ending = getNextToken(tokenBuffer.ptr(), &size, true);
        if (ending != kAttribute)
            return true;
        FXmlAttribute* attribute = tokenToAttribute(tokenBuffer.ptr(), size);
        if (!attribute)
            return false;
        attributes.put(attribute);
    }
}

/// Those behind blanks, up to the first that the tokenizer has to look at.
void FXmlParser::takePlainAttributes(FXmlAttributeList& attributes)
{
    const char* const limit = buffer + buffer.getFillSize();
    const char* place = buffer + bufferPos;
    while (true)
    {
        while (place < limit && (*place == ' ' || *place == '\t'))
            place++;
        FXmlAttribute* attribute = takePlainAttribute(place, limit);
        if (!attribute)
            return passPlain(place);
        attributes.put(attribute);
    }
}

/// name="value", and steps behind it. Null, with `place` where it was, for any other.
FXmlAttribute* FXmlParser::takePlainAttribute(const char*& place, const char* limit)
{
    const char* const begin = place;
    const char* const equals = findEnd(begin, limit, endsName);
    if (equals == begin || *begin == '/' || *begin == '>' || *begin == '?' || limit - equals < 2 ||
        *equals != '=' || (equals[1] != '"' && equals[1] != '\''))
        return nullptr;
    const char* const value = equals + 2;
    const char* end = value;
    bool hasReferences = false;
    while ((end = findEnd(end, limit, endsValue)) < limit && *end == '&')
    {
        hasReferences = true;
        end++;
    }
    if (end == limit || *end != equals[1] || equals - begin > kMaxAttributeName ||
        end - value > kMaxAttributeValue)
        return nullptr;
    place = end + 1;
    const std::string_view name(begin, static_cast<size_t>(equals - begin));
    const std::string_view text(value, static_cast<size_t>(end - value));
    if (!hasReferences)
        return makeAttribute(name, text);
    return decodeAttribute(name, text, tokenBuffer.ptr());
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
    if (nameEnd - token > kMaxAttributeName || value >= end || *equals != '=' ||
        end - 1 - value > kMaxAttributeValue)
        return nullptr;
    end[-1] = 0;
    return decodeAttribute({token, static_cast<size_t>(nameEnd - token)}, value, value);
}

/// The decoded value goes to `target`, as in `decodeReferences`.
FXmlAttribute* FXmlParser::decodeAttribute(std::string_view name, std::string_view value, char* target)
{
    bool sawHighBit = false;
    const size_t length = decodeReferences(value, target, &sawHighBit, (flags & kWindowsEntities) != 0);
    FXmlAttribute* attribute = makeAttribute(name, {target, length});
    if (sawHighBit && (flags & kWidenValues))
        attribute->value.toWideString(codePage);
    return attribute;
}

FXmlAttribute* FXmlParser::makeAttribute(std::string_view name, std::string_view value)
{
    FXmlAttribute* attribute = attributePool.takeLast();
    if (!attribute)
        attribute = new FXmlAttribute;
    attribute->name.refill(name.data(), static_cast<unsigned>(name.size()));
    attribute->value.refill(value.data(), static_cast<unsigned>(value.size()));
    return attribute;
}

// In such an order that the next tag's first attribute gets the object of this one's: its texts have often the size
// that is needed again.
void FXmlParser::recycle(FXmlAttributeList& attributes)
{
    while (FXmlAttribute* attribute = attributes.takeLast())
        if (!attributePool.put(attribute))
            attribute->release();
}
