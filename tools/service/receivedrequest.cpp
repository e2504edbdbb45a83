#include "tools/service/receivedrequest.h"

#include <algorithm>
#include <cstdio>

namespace
{

/// Control characters as backslash forms, so that a field stays one line.
std::string printable(const std::string& text)
{
    std::string result;
    for (const char character : text)
    {
        const auto code = static_cast<unsigned char>(character);
        if (character == '\n')
            result += "\\n";
        else if (code < 0x20 || code == 0x7F)
        {
            char hexadecimal[5];
            std::snprintf(hexadecimal, sizeof hexadecimal, "\\x%02X", code);
            result += hexadecimal;
        }
        else
            result.push_back(character);
    }
    return result;
}

std::string valueOf(const ReceivedField& field)
{
    if (!field.isFile)
        return "[" + printable(field.text) + "]";
    return "file \"" + printable(field.fileName) + "\", " + std::to_string(field.size) + " bytes, SHA-256 " +
           field.sha256.substr(0, 16) + "...";
}

} // namespace

std::string ReceivedRequest::path() const
{
    return target.substr(0, target.find('?'));
}

const ReceivedField* ReceivedRequest::field(const std::string& name) const
{
    const auto found = std::find_if(fields.begin(), fields.end(),
                                    [&](const ReceivedField& each) { return each.name == name; });
    return found == fields.end() ? nullptr : &*found;
}

std::string toText(const ReceivedRequest& request)
{
    std::string text =
        std::to_string(request.number) + ". " + request.method + " " + printable(request.target) + " -> ";
    text += request.status ? std::to_string(request.status) : std::string("no answer");
    if (request.behaviour != "accept")
        text += " (" + request.behaviour + ")";
    text += "\n";
    for (const ReceivedField& field : request.fields)
    {
        std::string name = field.name;
        name.resize(std::max<std::size_t>(name.size(), 22), ' ');
        text += "     " + name + " " + valueOf(field) + "\n";
    }
    return text;
}
