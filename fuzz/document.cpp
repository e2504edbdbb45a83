#include "fuzz/fuzztext.h"
#include "storage/stream/fmemorystream.h"
#include "storage/xml/xmldocument.h"

// A document that was loaded can be saved and loaded again, and then saves to the same bytes.

namespace
{
bool load(Xml::Document& document, const std::string& text)
{
    FMemoryStream stream(const_cast<char*>(text.data()), static_cast<int64>(text.size()));
    const bool isLoaded = document.load(&stream);
    require(isLoaded == (document.getRootElement() != nullptr));
    return isLoaded;
}

std::string save(Xml::Document& document, bool reformat)
{
    FMemoryStream stream;
    require(document.save(&stream, reformat));
    return std::string(stream.getData(), static_cast<size_t>(stream.getSize()));
}
} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    Xml::Document document;
    if (!load(document, std::string(reinterpret_cast<const char*>(data), size)))
        return 0;
    // What is written by number or name instead may grow beyond what the parser takes of one tag.
    constexpr size_t kAlwaysFits = 1 << 16;
    if (size > kAlwaysFits)
        return 0;
    const std::string saved = save(document, false);
    Xml::Document second;
    if (!load(second, saved))
    {
        // In the other encoding the library takes three characters for letters that it refuses in UTF-8.
        require(std::string(reinterpret_cast<const char*>(data), size).find_first_of("\xAA\xB5\xBA") !=
                std::string::npos);
        return 0;
    }
    const std::string again = save(second, false);
    require(load(document, again) && save(document, false) == again);
    require(load(document, save(second, true)));
    return 0;
}
