#pragma once

#include "foundation/object/funknown.h"

/// Gives texts in the user's language. *Thread-safe* while no texts are added.
class ITranslator : public FUnknown
{
public:
    /// The translation of an English text, or the text itself, or null where the translator was told so. The result
    /// lives as long as the translator or as `text`. Null for null.
    virtual const char16* translate(const char16* text) = 0;
    /// The translation; null where there is none, whatever the translator was told.
    virtual const char16* translate2(const char16* text) = 0;
    /// Copies the result of `translate` to `buffer`, cut to `size` - 1 characters and terminated. False, with an empty
    /// text, where that is null.
    virtual bool translate(const char16* text, char16* buffer, int size) = 0;
    /// The English text of a translation; `text` itself where it is none.
    virtual const char16* untranslate(const char16* text) = 0;

    DECLARE_INTERFACE_ID
};
