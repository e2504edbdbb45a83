#pragma once

#include "services/localisation/itranslationreceiver.h"

/// Looks whether each translation has the printf places of its key, and stops the parser at the first that hasn't.
///
/// The places must be the same in kind and order, since a text goes to printf with the arguments of its key; "=" and
/// "%%" are no places. *One thread at a time.*
class UTranslationChecker : public ITranslationReceiver
{
public:
    void addLanguage(const char* code, const char16* name) override;
    int addTranslation(const char16* key, const char* language, const char16* text) override;

    bool hasMismatch() const { return mismatch; }

    /// Whether both texts take the same printf arguments.
    static bool takeSameArguments(const char16* first, const char16* second);

private:
    bool mismatch = false;
};
