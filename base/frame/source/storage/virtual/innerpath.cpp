#include "storage/virtual/innerpath.h"

#include "storage/path/fnpath.h"
#include "storage/url/furl.h"

#include <string>
#include <string_view>

namespace
{
bool isDelimiter(char16 character)
{
    return character == kUnixDelimiter || character == kWindowsDelimiter;
}

bool step(std::u16string_view component, std::vector<FString>& components)
{
    if (component.empty() || component == u".")
        return true;
    if (component != u"..")
    {
        components.emplace_back(component.data(), static_cast<int>(component.size()), false);
        return true;
    }
    if (components.empty())
        return false;
    components.pop_back();
    return true;
}
} // namespace

FString InnerPath::textOf(const FPath& path)
{
    FString text;
    path.getFullPath(text);
    text.toWideString();
    return text;
}

bool InnerPath::split(const FPath& path, std::vector<FString>& components)
{
    components.clear();
    const FString text = textOf(path);
    const std::u16string_view characters(text.text16(), text.length());
    for (std::size_t begin = 0; begin <= characters.size();)
    {
        std::size_t end = begin;
        while (end < characters.size() && !isDelimiter(characters[end]))
            end++;
        if (!step(characters.substr(begin, end - begin), components))
            return false;
        begin = end + 1;
    }
    return true;
}

FString InnerPath::join(const std::vector<FString>& components)
{
    // Texts that grow by pieces look for their end each time, and a path of an enemy is long.
    std::u16string text;
    for (const FString& component : components)
        text.append(1, PATH_DELIMITER).append(component.text16());
    if (text.empty())
        text = PATH_DELIMITER;
    return text.c_str();
}

IPtr<FPath> InnerPath::childOf(const FPath& folder, const FString& name, int type)
{
    if (const FNPath* native = FCast(FNPath, &folder))
        return adopt(new FNPath(name.text16(), native, type));
    const FUrl* url = FCast(FUrl, &folder);
    if (!url)
        return adopt(new FPath(name.text16(), &folder, type));
    const IPtr<FUrl> child = adopt(new FUrl(*url));
    child->descend(name.text16(), type);
    return child;
}

bool InnerPath::getDirName(const FPath& path, FString& result)
{
    std::vector<FString> components;
    if (!split(path, components))
        return false;
    if (!path.isFolder() && !components.empty())
        components.pop_back();
    result = join(components);
    return true;
}
