#include "services/localisation/utranslationparser.h"

#include "foundation/text/cmstring.h"
#include "foundation/text/iuseralert.h"
#include "services/localisation/utranslationparserold.h"
#include "services/localisation/utranslationxmlhandlernew.h"
#include "storage/stream/fmemorystream.h"
#include "storage/xml/fxmlparser2.h"

#include <algorithm>
#include <cstring>

namespace
{
constexpr int kSearchedBytes = 127;
constexpr char kUtf8Mark[] = "\xEF\xBB\xBF";
} // namespace

UTranslationParser::UTranslationParser(const char* text, int length, ITranslationReceiver& target)
    : data(text),
      size(length),
      receiver(target)
{
}

bool UTranslationParser::go(bool reportErrors)
{
    if (!data || size <= 0)
        return false;
    const bool done = isNewFormat() ? readNew() : readOld();
    if (!done && reportErrors)
        report();
    return done;
}

bool UTranslationParser::isNewFormat() const
{
    if (size >= 4 && memcmp(data, kUtf8Mark, 3) == 0)
        return true;
    char beginning[kSearchedBytes + 1] = {};
    memcpy(beginning, data, static_cast<size_t>(std::min(size, kSearchedBytes)));
    return ConstString(beginning).findNext(0, "encoding=\"utf-8\"", kCaseInsensitive) >= 0;
}

bool UTranslationParser::readNew()
{
    FMemoryStream stream(const_cast<char*>(data), size);
    const auto handler = adopt(new UTranslationXmlHandlerNew(receiver));
    const auto parser = adopt(new FXmlParser2(handler, "UTF-8"));
    if (parser->process(&stream))
        return true;
    const auto context = adopt(new CmString);
    parser->getErrorContext(*context);
    message = *context;
    line = static_cast<int>(parser->getCurrentLineNumber());
    return false;
}

bool UTranslationParser::readOld()
{
    UTranslationParserOld parser(data, size, receiver);
    if (parser.parse())
        return true;
    parser.makeErrorMessage(message);
    line = parser.getLine();
    return false;
}

void UTranslationParser::report() const
{
    IUserAlert* alert = IUserAlert::get();
    if (!alert)
        return;
    FString text(message);
    FString place;
    place.printf("Line: %d", line);
    // The newer parser has said it already.
    if (text.findNext(0, place) < 0)
        text.append("\n").append(place);
    text.toWideString();
    alert->run(text.text16(), 0, nullptr, nullptr, nullptr);
}
