#include "foundation/text/cmstring.h"
#include "storage/xml/fxmlparser.h"
#include "storage/xml/fxmlscan.h"
#include "storage/xml/xmltext.h"

#include <algorithm>
#include <cstring>
#include <string_view>
#include <utility>

// Tags and attributes of the older parser. Most lie whole in the buffer and hold nothing that means something else;
// they are taken from where they lie. All others go the way of all tokens.

namespace
{
// Calculated without conditions, so that they fit in wide registers.

/// Whether it ends the name of a tag or is one of those that a name doesn't have.
constexpr auto endsTagName = [](uint8 c) -> bool
{
    const auto fromSlash = static_cast<uint8>(c ^ '/');
    const auto fromEnd = static_cast<uint8>(c ^ '>');
    return (c <= ' ') | (std::min(fromSlash, fromEnd) == 0);
};

/// Whether it ends the name of an attribute or is one of those that a name doesn't have.
constexpr auto endsName = [](uint8 c) -> bool { return (c <= ' ') | (c == '='); };

/// Whether it ends a value in such quotes, begins a reference, or is one of those that count as lines or end a text.
/// '&' differs from each of the quotes in one bit, so one comparison finds both.
template <uint8 quote>
constexpr auto endsValue = [](uint8 c) -> bool { return (c < ' ') | ((c | (quote ^ '&')) == (quote | '&')); };

/// An attribute that lies whole in the buffer: name="value".
struct PlainAttribute
{
    std::string_view name;
    std::string_view value;
    bool hasReferences;
    const char* end;
};

/// The first byte that `endsValue` tells.
const char* findValueEnd(const char* begin, char quote)
{
    return quote == '"' ? FXmlScan::findEnd(begin, endsValue<'"'>)
                        : FXmlScan::findEnd(begin, endsValue<'\''>);
}

bool findPlainAttribute(const char* begin, PlainAttribute& found)
{
    if (*begin == '/' || *begin == '>' || *begin == '?')
        return false;
    const char* const equals = FXmlScan::findEnd(begin, endsName);
    const char quote = *equals == '=' ? equals[1] : '\0';
    if ((quote != '"' && quote != '\'') || equals == begin || equals - begin > FXmlParser::kMaxAttributeName)
        return false;
    const char* const value = equals + 2;
    const char* end = findValueEnd(value, quote);
    found.hasReferences = *end == '&';
    while (*end == '&')
        end = findValueEnd(end + 1, quote);
    found.name = {begin, static_cast<size_t>(equals - begin)};
    found.value = {value, static_cast<size_t>(end - value)};
    found.end = end + 1;
    return *end == quote && end - value <= FXmlParser::kMaxAttributeValue;
}
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

// The object of an element that was closed, if there is one.
CmString* FXmlParser::newTagName()
{
    const int last = spareNames.total() - 1;
    auto* name = static_cast<CmString*>(spareNames.at(last));
    if (!name)
        return new CmString(tagName.ptr());
    spareNames.removeAt(last);
    name->refill(tagName.ptr(), static_cast<unsigned>(strlen(tagName.ptr())));
    return name;
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
    auto* name = static_cast<CmString*>(tagStack.pop());
    if (error == kNoError && !skipping && !endTag(name->text8(), data))
        fail(kErrorUnexpectedTag);
    // A name that a handler keeps is no longer ours to change.
    if (name && (name->getRefCount() > 1 || !spareNames.add(name)))
        name->release();
}

/// The start of a tag up to its attributes; leaves its name in `tagName`.
bool FXmlParser::takePlainTagName()
{
    const char* const begin = buffer + bufferPos;
    if (bufferPos >= buffer.getFillSize() || begin[0] != '<' || begin[1] == '!' || begin[1] == '/' ||
        begin[1] == '?')
        return false;
    const char* const end = FXmlScan::findEnd(begin + 1, endsTagName);
    const bool isEnd = Xml::isXmlSpace(*end) || *end == '/' || *end == '>';
    if (!isEnd || end - begin > kMaxToken)
        return false;
    const auto length = static_cast<size_t>(end - begin - 1);
    memcpy(tagName.ptr(), begin + 1, length);
    tagName.ptr()[length] = 0;
    passPlain(end);
    return true;
}

/// The end of the innermost element, where an end tag stands.
bool FXmlParser::takePlainEndTag()
{
    const char* const begin = buffer + bufferPos;
    const auto* name = static_cast<CmString*>(tagStack.peek());
    if (!name)
        return false;
    const char* const end = begin + 2 + name->length();
    if (buffer + buffer.getFillSize() <= end || *end != '>' ||
        memcmp(begin + 2, name->text8(), name->length()) != 0)
        return false;
    passPlain(end + 1);
    return true;
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
        if (readOnInsideTag())
            continue;
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

inline FXmlAttribute* FXmlParser::makeAttribute(std::string_view name, std::string_view value)
{
    FXmlAttribute* attribute = attributePool.takeLast();
    if (!attribute)
        attribute = new FXmlAttribute;
    attribute->name.refill(name.data(), static_cast<unsigned>(name.size()));
    attribute->value.refill(value.data(), static_cast<unsigned>(value.size()));
    return attribute;
}

/// Whether more was read of a tag that goes on behind the buffer, so that its attributes lie whole in there. A stream
/// that gives less than it was asked for isn't asked for more than the tokens need.
bool FXmlParser::readOnInsideTag()
{
    const uint32 unread = buffer.getFillSize() - bufferPos;
    return blockSize > 1 && isBlockWhole && unread < kMaxToken && !memchr(buffer + bufferPos, '>', unread) &&
           refill();
}

/// Those behind blanks, up to the first that the tokenizer has to look at.
void FXmlParser::takePlainAttributes(FXmlAttributeList& attributes)
{
    const char* place = buffer + bufferPos;
    while (true)
    {
        while (*place == ' ' || *place == '\t')
            place++;
        PlainAttribute found;
        if (!findPlainAttribute(place, found) || mayProtectQuote(found.value))
            return passPlain(place);
        attributes.put(found.hasReferences ? decodeAttribute(found.name, found.value, tokenBuffer.ptr())
                                           : makeAttribute(found.name, found.value));
        place = found.end;
    }
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

// In such an order that the next tag's first attribute gets the object of this one's: its texts have often the size
// that is needed again.
void FXmlParser::recycle(FXmlAttributeList& attributes)
{
    if (attributes.giveAllTo(attributePool))
        return;
    while (FXmlAttribute* attribute = attributes.takeLast())
        attribute->release();
}
