#include "storage/xml/xmlentities.h"
#include "fuzz/fuzztext.h"
#include "storage/xml/fxmlparser.h"

namespace
{
/// What decoding means, spelled out; takes time that grows with the square of the text.
std::string decodeSlowly(const std::string& text, bool windowsTable)
{
    std::string result;
    for (size_t i = 0; i < text.size(); i++)
    {
        const size_t end = text[i] == '&' ? text.find(';', i) : std::string::npos;
        uint8 character = 0;
        if (end != std::string::npos)
            character = decodeXmlEntity(text.c_str() + i + 1, static_cast<int>(end - i) - 1, windowsTable);
        result += character ? static_cast<char>(character) : text[i];
        i = character ? end : i;
    }
    return result;
}
} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    constexpr size_t kTrySlowly = 300;
    const std::string text = std::string(reinterpret_cast<const char*>(data), size).c_str();
    for (const bool windowsTable : {false, true})
    {
        std::string decoded = text;
        bool sawHighBit = false;
        FXmlParser::removeEntities(decoded.data(), &sawHighBit, windowsTable);
        decoded.resize(strlen(decoded.c_str()));
        require(decoded.size() <= text.size() && (!sawHighBit || decoded.size() < text.size()));
        if (text.size() <= kTrySlowly)
            require(decoded == decodeSlowly(text, windowsTable));
    }
    return 0;
}
