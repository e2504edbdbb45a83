#include "storage/filesystem/diskname.h"

#include "storage/filesystem/platformfiles.h"
#include "storage/path/filenametext.h"
#include "storage/path/fnpath.h"

namespace
{
// A name that composes to `component`; empty where the folder has none.
std::string findComposing(const std::string& folder, const ConstString& component)
{
    std::vector<std::string> names;
    PlatformFiles::list(folder.empty() ? "." : folder, names);
    for (const std::string& name : names)
    {
        String text;
        FileNameText::fromBytes(name.c_str(), text);
        text.normalize(kUnicodeNormC);
        if (!text.isAsciiString() && text == component)
            return name;
    }
    return {};
}

// The spelling of a component in `folder`, which ends in a delimiter or is empty; empty where there is none.
std::string spell(const std::string& folder, const ConstString& component)
{
    const std::string written = FileNameText::toBytes(component);
    if (PlatformFiles::isTaken(folder + written))
        return written;
    if (component.isAsciiString())
        return {};
    const std::string decomposed = FileNameText::toDecomposedBytes(component);
    return PlatformFiles::isTaken(folder + decomposed) ? decomposed : findComposing(folder, component);
}

std::string findByComponents(const FString& text)
{
    std::string found;
    unsigned begin = 0;
    while (begin < text.length())
    {
        int end = text.findNext(static_cast<int>(begin), PATH_DELIMITER);
        if (end < 0)
            end = static_cast<int>(text.length());
        FString component;
        text.extract(component, begin, end - static_cast<int>(begin));
        const std::string spelling = end > static_cast<int>(begin) ? spell(found, component) : std::string();
        if (spelling.empty() && end > static_cast<int>(begin))
            return found + FileNameText::toBytes(ConstString(text.text16() + begin));
        found += spelling;
        if (end < static_cast<int>(text.length()))
            found += static_cast<char>(PATH_DELIMITER);
        begin = static_cast<unsigned>(end) + 1;
    }
    return found;
}
} // namespace

std::string DiskName::find(const FNPath& path)
{
    FString text;
    path.getFullPath(text);
    std::string written = FileNameText::toBytes(text);
    if (text.isAsciiString() || PlatformFiles::isTaken(written))
        return written;
    return findByComponents(text);
}
