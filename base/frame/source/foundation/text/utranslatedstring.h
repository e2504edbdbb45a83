#pragma once

#include "foundation/text/conststringtable.h"

#include <atomic>

/// A text for the user: the English literal, which is the key of its translation as well.
///
/// The first `text` asks the translator, and its answer holds for the rest of the run: a text that is read before
/// the translator is ready stays English. Made as a static object in the file that uses it. *Thread-safe*: a race
/// stores the same pointer twice.
class UTranslatedString
{
public:
    using Translator = const char16* (*)(const char16* key);

    /// `literal` lives forever.
    explicit UTranslatedString(const char* literal);

    /// Never null; lives as long as the process.
    const char16* text() const;
    const char16* getKey() const { return key; }

    /// Who is asked; without one the key is its own translation.
    static void setTranslator(Translator function);

private:
    const char16* key;
    mutable std::atomic<const char16*> cached = nullptr;

    static Translator translator;
};
