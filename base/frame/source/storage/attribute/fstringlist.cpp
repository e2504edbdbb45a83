#include "storage/attribute/fstringlist.h"

#include "foundation/object/fvariant.h"
#include "foundation/text/fstring.h"
#include "storage/attribute/farchive.h"

#include <cstdlib>

DEFINE_CLASS(FStringList, FAttrList)

namespace
{
/// A `malloc`ed copy in 16 bits.
char16* copyText(const void* text, bool wide)
{
    FString copy;
    if (wide)
        copy.assign(static_cast<const char16*>(text));
    else
        copy.assign(static_cast<const char*>(text));
    copy.toWideString();
    if (copy.isEmpty())
        copy.resize(1, true);
    return static_cast<char16*>(copy.pass());
}
} // namespace

FStringList::FStringList(const FStringList& other) : FAttrList(other), texts(other.texts)
{
    for (Text& text : texts)
        text = {copyText(text.text, true), true};
}

FStringList::~FStringList()
{
    removeAll();
}

void FStringList::removeAll()
{
    for (const Text& text : texts)
        if (text.isOwned)
            free(const_cast<char16*>(text.text));
    texts.clear();
}

void FStringList::queue(const void* text, bool wide, bool copy)
{
    if (!text)
        texts.push_back({u"", false});
    else if (wide && !copy)
        texts.push_back({static_cast<const char16*>(text), false});
    else
        texts.push_back({copyText(text, wide), true});
}

void FStringList::makeOwner()
{
    for (Text& text : texts)
        if (!text.isOwned)
            text = {copyText(text.text, true), true};
}

const char16* FStringList::unqueue()
{
    const int index = advance();
    return index < 0 ? nullptr : at(index);
}

bool FStringList::unqueueVariant(FVariant& value)
{
    const char16* text = unqueue();
    if (!text)
        return false;
    value.setString16(text);
    return true;
}

bool FStringList::externalize(FArchive& archive) const
{
    if (!archive.writeCount(total()))
        return false;
    for (const Text& text : texts)
        if (!FString::storeString16(archive.getStream(), text.text))
            return false;
    return true;
}

bool FStringList::internalize(FArchive& archive)
{
    removeAll();
    reset();
    int count = 0;
    if (!archive.readCount(count))
        return false;
    for (int i = 0; i < count; i++)
    {
        FString text;
        if (!text.load(archive.getStream()))
            return false;
        queue(text.text16(), true, true);
    }
    return true;
}
