#include "services/localisation/utranslationparserold.h"

#include "foundation/text/cmstring.h"
#include "services/localisation/itranslationreceiver.h"
#include "services/localisation/utranslationxmlhandlernew.h"
#include "storage/xml/fxmlparser.h"
#include "storage/xml/xmltext.h"

#include <algorithm>
#include <cstring>
#include <string_view>

using Xml::isXmlSpace;

namespace
{
/// How much of the text an error message shows on either side.
constexpr int kShownAround = 60;

// The words of the messages are kept as they are, since users and tools know them.
constexpr char kAttributeNotValid[] = "Attribute field not valid";
constexpr char kUnexpectedEndTag[] = "Non expected end tag";
constexpr char kEndTagSyntax[] = "syntax error at end tag";
constexpr char kUnsupportedDeclaration[] = "Non supported '<!' tag";
constexpr char kCommentTooLong[] = "Too int32 comment";
constexpr char kCommentNotClosed[] = "Non closed comment";
constexpr char kTooManyAttributes[] = "Too many attribute/value pairs";
constexpr char kInstructionTooLong[] = "Too int32 processing instruction";
constexpr char kInstructionNotClosed[] = "Non closed processing instruction ( '<? ... ?>')";
constexpr char kNameNotLegal[] = "Name is not legal";
constexpr char kNameTooLong[] = "Name too int32";
constexpr char kValueInvalid[] = "Attribute value invalid (or too int32)";
constexpr char kNoPlaceForText[] = "The context is not valid for raw text yet!";
constexpr char kKeyNotSet[] = "The key is not set!";
constexpr char kCodeNotSet[] = "The language code is not set! Can't read a language name yet!";
constexpr char kLanguageNotSet[] = "The language is not set!";
constexpr char kAttributesNotSupported[] = "Attribute/value pairs are not supported";
constexpr char kKeyFirst[] = "You must set the string key first!";
constexpr char kTranslationNotFinished[] = "You haven't finished the previous translation!";
constexpr char kKeyAlreadySet[] = "The string key is already set!";

bool isNameStart(char c)
{
    return CmString::isCharAlpha(c) || c == '_' || (c & 0x80);
}

bool isNamePart(char c)
{
    return isNameStart(c) || CmString::isCharDigit(c) || c == '-' || c == '.' || c == ':';
}
} // namespace

const FString* UTranslationParserOld::Tag::valueOf(const char* attribute) const
{
    for (int i = 0; i < count; i++)
        if (attributes[i] == attribute)
            return &values[i];
    return nullptr;
}

UTranslationParserOld::UTranslationParserOld(const char* text8, int length, ITranslationReceiver& target)
    : data(text8),
      size(length),
      receiver(target)
{
    openTags.takeElements();
}

bool UTranslationParserOld::fail(const char* message)
{
    error = message;
    return false;
}

bool UTranslationParserOld::parse()
{
    while (position < size)
        if (!(data[position] == '<' ? readMarkup() : readText()))
            return false;
    return openTags.isEmpty() || fail(kEndTagSyntax);
}

int UTranslationParserOld::getLine() const
{
    return 1 + static_cast<int>(std::count(data, data + std::min(position, size), '\n'));
}

void UTranslationParserOld::makeErrorMessage(FString& message) const
{
    const int begin = std::max(position - kShownAround, 0);
    const int end = std::min(position + kShownAround, size);
    message.assign(error);
    message.append("\n");
    message.append(String(data + begin, std::min(position, size) - begin, false));
    message.append("  <====== HERE ======  ");
    if (position < end)
        message.append(String(data + position, end - position, false));
}

// Text to tags

bool UTranslationParserOld::startsWith(const char* text8) const
{
    const size_t length = strlen(text8);
    return static_cast<size_t>(size - position) >= length && memcmp(data + position, text8, length) == 0;
}

/// The place of the text from the position on; -1 where there is none.
int UTranslationParserOld::find(const char* wanted) const
{
    const size_t found =
        std::string_view(data, static_cast<size_t>(size)).find(wanted, static_cast<size_t>(position));
    return found == std::string_view::npos ? -1 : static_cast<int>(found);
}

void UTranslationParserOld::skipSpace()
{
    while (position < size && isXmlSpace(data[position]))
        position++;
}

bool UTranslationParserOld::skipPast(const char* end, const char* tooLong, const char* notClosed)
{
    const int found = find(end);
    if (found < 0)
        return fail(notClosed);
    if (found - position > kMaxComment)
        return fail(tooLong);
    position = found + static_cast<int>(strlen(end));
    return true;
}

bool UTranslationParserOld::readMarkup()
{
    if (startsWith("<!--"))
        return skipPast("-->", kCommentTooLong, kCommentNotClosed);
    if (startsWith("<!"))
        return fail(kUnsupportedDeclaration);
    if (startsWith("<?"))
        return skipPast("?>", kInstructionTooLong, kInstructionNotClosed);
    return startsWith("</") ? readEndTag() : readStartTag();
}

bool UTranslationParserOld::readName(FString& name)
{
    const int begin = position;
    if (position >= size || !isNameStart(data[position]))
        return fail(kNameNotLegal);
    while (position < size && isNamePart(data[position]))
        position++;
    if (position - begin > kMaxName)
        return fail(kNameTooLong);
    name.assign(data + begin, position - begin, false);
    return true;
}

bool UTranslationParserOld::readStartTag()
{
    position++;
    Tag tag;
    if (!readName(tag.name) || !readAttributes(tag))
        return false;
    const bool isEmpty = data[position] == '/';
    position += isEmpty ? 2 : 1;
    if (openTags.total() >= kMaxDepth)
        return fail(kNameNotLegal);
    openTags.push(new CmString(tag.name));
    return beginElement(tag) && (!isEmpty || endElement(tag.name));
}

// Leaves the position at the '>' or "/>" that ends the tag.
bool UTranslationParserOld::readAttributes(Tag& tag)
{
    while (true)
    {
        skipSpace();
        if (startsWith(">") || startsWith("/>"))
            return true;
        if (tag.count == kMaxAttributes)
            return fail(kTooManyAttributes);
        if (!readAttribute(tag))
            return false;
    }
}

bool UTranslationParserOld::readAttribute(Tag& tag)
{
    if (!readName(tag.attributes[tag.count]))
        return fail(kAttributeNotValid);
    skipSpace();
    if (!startsWith("="))
        return fail(kAttributeNotValid);
    position++;
    skipSpace();
    return decodeAttributeValue(tag.values[tag.count++]);
}

bool UTranslationParserOld::decodeAttributeValue(FString& value)
{
    if (!startsWith("\"") && !startsWith("'"))
        return fail(kValueInvalid);
    const char quote[2] = {data[position], 0};
    position++;
    const int end = find(quote);
    if (end < 0 || end - position > kMaxValue)
        return fail(kValueInvalid);
    Buffer decoded;
    decodeCharData(data + position, end - position, decoded);
    value.assign(decoded.str8(), static_cast<int>(decoded.getFillSize()), false);
    position = end + 1;
    return true;
}

void UTranslationParserOld::decodeCharData(const char* from, int length, Buffer& result)
{
    const auto count = static_cast<uint32>(length);
    const uint32 before = result.getFillSize();
    if (!result.put(from, count) || !result.put('\0'))
        return;
    FXmlParser::removeEntities(result + before, nullptr, false);
    result.setFillSize(before + static_cast<uint32>(strlen(result + before)));
}

bool UTranslationParserOld::readEndTag()
{
    position += 2;
    FString name;
    if (!readName(name))
        return fail(kEndTagSyntax);
    skipSpace();
    if (!startsWith(">"))
        return fail(kEndTagSyntax);
    position++;
    return endElement(name);
}

bool UTranslationParserOld::readText()
{
    const int found = find("<");
    const int end = found < 0 ? size : found;
    const char* from = data + position;
    const int length = end - position;
    const bool isWanted = place == Place::kLanguage || place == Place::kTranslation;
    if (!isWanted && !Xml::isXmlSpace(from, static_cast<size_t>(length)))
        return fail(kNoPlaceForText);
    if (place == Place::kLanguage && language.isEmpty())
        return fail(kCodeNotSet);
    if (isWanted)
        decodeCharData(from, length, text);
    position = end;
    return true;
}

// Tags to rows

bool UTranslationParserOld::beginElement(const Tag& tag)
{
    if (tag.name == "LanguageTable")
        return beginTable(tag, Place::kLanguageTable);
    if (tag.name == "StringTable")
        return beginTable(tag, Place::kStringTable);
    if (tag.name == "language" && place == Place::kLanguageTable)
        return beginLanguage(tag);
    if (tag.name == "String")
        return beginString(tag);
    return tag.name != "Translation" || beginTranslation(tag);
}

bool UTranslationParserOld::beginTable(const Tag& tag, Place table)
{
    if (tag.count > 0)
        return fail(kAttributesNotSupported);
    place = table;
    return true;
}

bool UTranslationParserOld::beginLanguage(const Tag& tag)
{
    const FString* code = tag.valueOf("key");
    language = code ? *code : FString();
    text.flush();
    place = Place::kLanguage;
    return true;
}

bool UTranslationParserOld::beginString(const Tag& tag)
{
    if (place == Place::kTranslation)
        return fail(kTranslationNotFinished);
    if (place == Place::kString)
        return fail(kKeyAlreadySet);
    const FString* newKey = tag.valueOf("Key");
    if (!newKey || newKey->isEmpty())
        return fail(kKeyNotSet);
    key = *newKey;
    key.toWideString();
    UTranslationXmlHandlerNew::removeCppCoding(key);
    place = Place::kString;
    return true;
}

bool UTranslationParserOld::beginTranslation(const Tag& tag)
{
    if (place == Place::kTranslation)
        return fail(kTranslationNotFinished);
    if (place != Place::kString)
        return fail(kKeyFirst);
    const FString* code = tag.valueOf("language");
    if (!code || code->isEmpty())
        return fail(kLanguageNotSet);
    language = *code;
    text.flush();
    place = Place::kTranslation;
    return true;
}

bool UTranslationParserOld::endElement(const FString& name)
{
    const auto open = adopt(static_cast<CmString*>(openTags.pop()));
    if (!open || !(*open == name))
        return fail(kUnexpectedEndTag);
    return endKnownElement(name);
}

bool UTranslationParserOld::endKnownElement(const FString& name)
{
    if (name == "Translation")
        return endTranslation();
    if (name == "String")
        place = Place::kStringTable;
    else if (name == "LanguageTable" || name == "StringTable")
        place = Place::kOutside;
    else if (name == "language" && place == Place::kLanguage)
    {
        FString languageName;
        takeText(languageName);
        if (!language.isEmpty() && !languageName.isEmpty())
            receiver.addLanguage(language.text8(), languageName.text16());
        place = Place::kLanguageTable;
    }
    return true;
}

bool UTranslationParserOld::endTranslation()
{
    place = Place::kString;
    FString translation;
    takeText(translation);
    if (translation.isEmpty())
        return true;
    UTranslationXmlHandlerNew::removeCppCoding(translation);
    return receiver.addTranslation(key.text16(), language.text8(), translation.text16()) !=
           ITranslationReceiver::kStop;
}

void UTranslationParserOld::takeText(FString& result)
{
    result.assign(text.str8(), static_cast<int>(text.getFillSize()), false);
    result.toWideString();
    text.flush();
}
