#include "services/localisation/utranslationxmlhandlernew.h"

#include "services/localisation/itranslationreceiver.h"
#include "storage/xml/inewxmlparser.h"
#include "storage/xml/xmltext.h"

#include <cstring>

namespace
{
/// The value of an attribute; null where there is none.
const char* valueOf(const char** attributes, const char* name)
{
    for (; attributes[0]; attributes += 2)
        if (strcmp(attributes[0], name) == 0)
            return attributes[1];
    return nullptr;
}

bool isTag(const char* name, const char* wanted)
{
    return strcmp(name, wanted) == 0;
}

/// The character that a backslash and `letter` stand for; 0 where they stand for themselves.
char16 coded(char16 letter)
{
    if (letter == 'n')
        return '\n';
    return letter == 't' ? u'\t' : u'\0';
}
} // namespace

UTranslationXmlHandlerNew::UTranslationXmlHandlerNew(ITranslationReceiver& target) : receiver(target) {}

void UTranslationXmlHandlerNew::startTag(INewXmlParser* parser, const char* name, const char** attributes)
{
    if (state == State::kString)
        text.flush();
    else if (isTag(name, "LanguageTable"))
        state = State::kLanguageTable;
    else if (isTag(name, "language") && state == State::kLanguageTable)
        beginLanguage(parser, attributes);
    else if (isTag(name, "StringTable"))
        state = State::kStringTable;
    else if (isTag(name, "String") && state == State::kStringTable)
        beginString(attributes);
}

void UTranslationXmlHandlerNew::beginLanguage(INewXmlParser* parser, const char** attributes)
{
    const char* value = valueOf(attributes, "key");
    if (!value)
        return parser->stop();
    code.assign(value);
    state = State::kLanguage;
}

void UTranslationXmlHandlerNew::beginString(const char** attributes)
{
    const char* value = valueOf(attributes, "Key");
    Xml::assignUtf8(key, value ? value : "");
    removeCppCoding(key);
    state = State::kString;
}

void UTranslationXmlHandlerNew::charData(INewXmlParser*, const char* data, int length)
{
    if (state == State::kLanguage || state == State::kString)
        text.put(data, static_cast<uint32>(length));
}

void UTranslationXmlHandlerNew::endTag(INewXmlParser* parser, const char* name)
{
    if (isTag(name, "String"))
        state = State::kStringTable;
    else if (state == State::kLanguageTable || state == State::kStringTable)
        state = State::kOutside;
    else if (state == State::kLanguage)
        endLanguage(parser, name);
    else if (state == State::kString)
        endTranslation(parser, name);
    text.flush();
}

void UTranslationXmlHandlerNew::endLanguage(INewXmlParser* parser, const char* name)
{
    if (!isTag(name, "language"))
        return parser->stop();
    FString languageName;
    takeText(languageName);
    if (!code.isEmpty() && !languageName.isEmpty())
        receiver.addLanguage(code.text8(), languageName.text16());
    state = State::kLanguageTable;
}

void UTranslationXmlHandlerNew::endTranslation(INewXmlParser* parser, const char* name)
{
    FString translation;
    takeText(translation);
    if (key.isEmpty() || translation.isEmpty())
        return;
    removeCppCoding(translation);
    if (receiver.addTranslation(key.text16(), name, translation.text16()) == ITranslationReceiver::kStop)
        parser->stop();
}

void UTranslationXmlHandlerNew::takeText(FString& result)
{
    Xml::assignUtf8(result, text.str8(), text.getFillSize());
}

void UTranslationXmlHandlerNew::removeCppCoding(FString& string)
{
    if (string.findNext(0, '\\') < 0)
        return;
    Buffer decoded;
    const char16* from = string.text16();
    while (*from)
    {
        const char16 character = *from == '\\' ? coded(from[1]) : u'\0';
        decoded.put(character ? character : *from);
        from += character ? 2 : 1;
    }
    string.assign(reinterpret_cast<const char16*>(decoded.ptr()),
                  static_cast<int>(decoded.getFillSize() / sizeof(char16)), false);
}
