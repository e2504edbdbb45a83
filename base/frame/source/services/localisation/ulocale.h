#pragma once

#include "foundation/object/types.h"

class ConstString;

/// Index of a language in the table of the system: 0 is English.
using ULanguage = int;

inline constexpr ULanguage kLanguageEnglish = 0;
inline constexpr ULanguage kLanguageJapanese = 3;
inline constexpr ULanguage kLanguageChinese = 9;
inline constexpr ULanguage kLanguageKorean = 17;
inline constexpr int kLanguageCount = 50;

/// The languages by name, and their two-letter codes: our own, with "us", "jp" and "bp" among them.
extern const char16* const gLanguageTable[kLanguageCount];
extern const char* const gLanguageCodeTable[kLanguageCount];

/// What the process knows of languages: the system's, the user's choice, and where double bytes begin.
///
/// One object a process, by `__getLocale`. *Main thread*: the first question for the system's language asks the
/// platform, and settles the default encoding of 8-bit text.
class ULocale
{
public:
    ULanguage getSystemLanguage();
    /// The last of the names, separated by line feeds, that the table has in any case; English without one.
    static ULanguage getLastKnownLanguage(const ConstString& names);
    /// What was set, else the system's.
    ULanguage getUserLanguage();
    void setUserLanguage(ULanguage language);

    /// Null out of range.
    const char* getLanguageCode(int language) const;
    const char16* getLanguageString(int language) const;
    /// What no row has is English.
    ULanguage getLanguageFromString(const char16* name) const;
    ULanguage getLanguageFromCode(const char* code) const;

    bool isLeadByteLanguage(int language) const;
    bool isLeadByte(int language, unsigned char byte) const;

    /// 0 the system of the United States, 1 the metric one, -1 another or unknown.
    int getMeasure() const;

private:
    int systemLanguage = 0;
    int userLanguage = 0;
    bool systemLanguageKnown = false;
    bool userLanguageSet = false;
};

ULocale& __getLocale();
