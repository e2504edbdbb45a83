#include "storage/virtual/innerpath.h"

#include "storage/path/fnpath.h"
#include "storage/url/furl.h"

#include <string>

namespace
{
bool isDelimiter(char16 character)
{
    return character == kUnixDelimiter || character == kWindowsDelimiter;
}

bool step(const FString& component, std::vector<FString>& components)
{
    if (component.isEmpty() || component == ConstString("."))
        return true;
    if (!(component == ConstString("..")))
    {
        components.push_back(component);
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
    for (unsigned begin = 0; begin <= text.length();)
    {
        unsigned end = begin;
        while (end < text.length() && !isDelimiter(text.getChar16(end)))
            end++;
        FString component;
        if (end > begin)
            text.extract(component, begin, static_cast<int>(end - begin));
        if (!step(component, components))
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
