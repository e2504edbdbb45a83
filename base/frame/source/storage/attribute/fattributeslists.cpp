#include "foundation/text/string.h"
#include "storage/attribute/fattributes.h"

#include <cstring>

// Copying between an attribute tree and the lists of components.

namespace
{
constexpr char kAdditional[] = "Additional Attributes";

bool isListValue(const FAttributeValue& value)
{
    return value.getType() & (FAttributeValue::kInteger | FAttributeValue::kFloat | FAttributeValue::kString);
}

/// The key in the list; false where the list has no such key.
template <class List>
bool toListKey(const char* key, const char*& result)
{
    result = key;
    return strcmp(key, kAdditional) != 0;
}
template <class List>
bool toListKey(const char* key, unsigned int& result)
{
    return FIntIDAttribute::parseKey(key, result) && result != FAttributes::kAdditionalAttributes;
}

void setAdditional(FIntAttributeList& list, FAttributes* tree)
{
    list.setObjAttribute(FAttributes::kAdditionalAttributes, tree, FAttributeValue::kBorrowed);
}
template <class List>
void setAdditional(List& list, FAttributes* tree)
{
    list.setObjAttribute(kAdditional, tree, FAttributeValue::kBorrowed);
}

void assignValue(FAttributeValue& target, const FAttributeValue& source)
{
    target = source;
}
} // namespace

template <class List>
void FAttributes::saveList(List& list) const
{
    using Key = decltype(list.entryAt(0)->getKey());
    auto additional = adopt(new FAttributes);
    for (int i = 0; i < total(); i++)
    {
        const FStringIDAttribute& value = *entryAt(i);
        Key key{};
        if (isListValue(value) && toListKey<List>(value.getKey(), key))
            assignValue(list.entry(key), value);
        else
            assignValue(additional->entry(value.getKey()), value);
    }
    if (!additional->isEmpty())
        setAdditional(list, additional);
}

template void FAttributes::saveList(FStringAttributeList&) const;
template void FAttributes::saveList(FStringAttributeArray&) const;

void FAttributes::saveAttributes(FIntAttributeList& list) const
{
    saveList(list);
}

void FAttributes::loadEntry(const char* key, bool isAdditional, const FAttributeValue& value)
{
    if (const auto* tree = isAdditional ? FCast(FAttributes, value.getObj()) : nullptr)
        addAllFrom(*tree);
    else
        assignValue(entry(key), value);
}

template <class List>
void FAttributes::loadList(const List& list)
{
    for (int i = 0; i < list.total(); i++)
    {
        const FStringIDAttribute& value = *list.entryAt(i);
        loadEntry(value.getKey(), strcmp(value.getKey(), kAdditional) == 0, value);
    }
}

template void FAttributes::loadList(const FStringAttributeList&);
template void FAttributes::loadList(const FStringAttributeArray&);

void FAttributes::loadAttributes(const FIntAttributeList& list)
{
    for (int i = 0; i < list.total(); i++)
    {
        const FIntIDAttribute& value = *list.entryAt(i);
        const std::string key = std::to_string(value.getKey());
        loadEntry(key.c_str(), value.getKey() == kAdditionalAttributes, value);
    }
}
