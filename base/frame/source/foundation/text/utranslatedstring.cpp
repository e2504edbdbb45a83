#include "foundation/text/utranslatedstring.h"

UTranslatedString::Translator UTranslatedString::translator = nullptr;

UTranslatedString::UTranslatedString(const char* literal)
    : key(ConstStringTable::instance().getString(literal))
{
}

const char16* UTranslatedString::text() const
{
    if (const char16* known = cached.load(std::memory_order_relaxed))
        return known;
    const char16* translation = translator ? translator(key) : key;
    if (!translation || translation[0] == 0)
        translation = kEmptyString16;
    cached.store(translation, std::memory_order_relaxed);
    return translation;
}

void UTranslatedString::setTranslator(Translator function)
{
    translator = function;
}
