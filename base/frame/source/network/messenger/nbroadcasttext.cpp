#include "network/messenger/nbroadcasttext.h"

#include "containers/sequence/cmlinkedlist.h"
#include "foundation/text/cmstring.h"
#include "storage/url/furl.h"

#include <string_view>

namespace
{
constexpr std::string_view kHello = "pock...pock...VELLAMOOR ";
constexpr std::string_view kGoodbye = "bye bye";
constexpr char kUnknown[] = "unknown";
constexpr int kForm = 1;

enum Value
{
    kProgram,
    kVersion,
    kPort,
    kHost,
    kValues
};

std::string encoded(const FString& value)
{
    FString text(value.isEmpty() ? FString(kUnknown) : value);
    FUrl::urlEncode(text);
    return text.text8();
}

FString decoded(const CmString& value)
{
    FString text(static_cast<const FString&>(value));
    FUrl::urlDecode(text);
    return text;
}

/// Takes the text off the front; false, and nothing taken, where it isn't there.
bool takeFront(std::string_view& data, std::string_view text)
{
    const bool isThere = data.substr(0, text.size()) == text;
    if (isThere)
        data.remove_prefix(text.size());
    return isThere;
}

bool readPort(const CmString& text, uint16& port)
{
    int64 number = 0;
    if (!text.scanInt64(number, 0, false) || number < 1 || number > 65535)
        return false;
    port = static_cast<uint16>(number);
    return true;
}
} // namespace

std::string NBroadcastText::print() const
{
    std::string text(isHello ? kHello : kGoodbye);
    if (!isHello)
        text += ' ';
    setBroadcastParams(text);
    return text;
}

void NBroadcastText::setBroadcastParams(std::string& text) const
{
    FString portText;
    portText.printf("%d", int{port});
    text += encoded(program) + ' ' + encoded(version) + ' ' + portText.text8() + ' ' + encoded(host) + ' ' +
            std::to_string(kForm);
}

bool NBroadcastText::parse(const char* data, unsigned size)
{
    std::string_view rest(data, size);
    if (size > kMaxSize)
        return false;
    isHello = takeFront(rest, kHello);
    if (!isHello && !takeFront(rest, kGoodbye))
        return false;
    CmLinkedList values;
    values.takeElements();
    CmString::split8(std::string(rest).c_str(), values, " ");
    if (values.total() < kValues)
        return false;
    const auto valueAt = [&](Value value) -> const CmString& { return *FCast(CmString, values.at(value)); };
    program = decoded(valueAt(kProgram));
    version = decoded(valueAt(kVersion));
    host = decoded(valueAt(kHost));
    return readPort(valueAt(kPort), port);
}
