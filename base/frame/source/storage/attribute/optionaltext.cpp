#include "storage/attribute/optionaltext.h"

#include "foundation/text/fstring.h"
#include "storage/attribute/fattributes.h"

void OptionalText::store(FAttributes& attributes, const char* key, const FString& text)
{
    if (!text.isEmpty())
        attributes.set(key, text);
}

void OptionalText::restore(const FAttributes& attributes, const char* key, FString& text)
{
    if (!attributes.get(key, text))
        text.assign(u"");
}
