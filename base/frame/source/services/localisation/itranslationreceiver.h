#pragma once

#include "foundation/object/types.h"

/// What a parser of a translation file hands its rows to. *One thread at a time.*
class ITranslationReceiver
{
public:
    /// Results of `addTranslation`; the parsers go on unless it is the last one.
    enum Result
    {
        kTaken = 0,
        kLeftOut = 1,
        kStop = 4
    };

    /// Texts are borrowed for the call.
    virtual void addLanguage(const char* code, const char16* name) = 0;
    virtual int addTranslation(const char16* key, const char* language, const char16* text) = 0;

protected:
    ~ITranslationReceiver() = default;
};
