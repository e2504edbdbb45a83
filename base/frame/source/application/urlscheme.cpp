#include "application/urlscheme.h"

#include "containers/typed/tarray.h"

#include <cstring>

namespace
{
struct Entry
{
    const char* scheme = nullptr;
    IURLSchemeHandler* handler = nullptr;

    bool operator==(const Entry& other) const = default;
};

TArray<Entry>& entries()
{
    static TArray<Entry> all;
    return all;
}

char lower(char character)
{
    return character >= 'A' && character <= 'Z' ? static_cast<char>(character + 'a' - 'A') : character;
}

/// Whether `text` begins with `scheme`, whatever the case of letters.
bool beginsWith(const char* text, const char* scheme)
{
    while (*scheme)
        if (lower(*text++) != lower(*scheme++))
            return false;
    return true;
}

bool isURLOf(const char* text, const char* scheme)
{
    return beginsWith(text, scheme) && text[strlen(scheme)] == ':';
}

void removeScheme(const char* scheme)
{
    for (int i = entries().total() - 1; i >= 0; i--)
        if (strcmp(entries()[i].scheme, scheme) == 0)
            entries().removeAt(i);
}
} // namespace

void URLScheme::setHandler(const char* scheme, IURLSchemeHandler* handler)
{
    removeScheme(scheme);
    if (handler)
        entries().add({scheme, handler});
}

IURLSchemeHandler* URLScheme::findHandler(const char* text)
{
    for (const Entry& entry : entries())
        if (isURLOf(text, entry.scheme))
            return entry.handler;
    return nullptr;
}
