#pragma once

#include "foundation/text/itextservices.h"

/// The text services, by ICU; the clock by the C library, whose zone the whole process goes by.
///
/// Languages and customs come from the environment, asked anew each time: LANGUAGE, LC_ALL, LC_MESSAGES, LC_TIME,
/// LC_MEASUREMENT and LANG, with the usual precedence. Thread-safe.
class IcuTextServices : public ITextServices
{
public:
    char16* toWide(const char* text, unsigned length, unsigned encoding, char16 loss,
                   unsigned& resultLength) override;
    char* toMultiByte(const char16* text, unsigned length, unsigned encoding, char loss,
                      unsigned& resultLength) override;

    char16 toUpper(char16 character) override;
    char16 toLower(char16 character) override;
    bool isAlpha(char16 character) override;
    bool isUpper(char16 character) override;
    bool isLower(char16 character) override;
    int compareIgnoringCase(const char16* a, unsigned lengthA, const char16* b, unsigned lengthB) override;
    char16* normalize(const char16* text, unsigned length, UnicodeNormalization form,
                      unsigned& resultLength) override;
    bool isNormalized(const char16* text, unsigned length, UnicodeNormalization form) override;

    bool formatDate(const TextDate& date, TextDateStyle style, String& result) override;
    bool formatTime(const TextTime& time, bool withSeconds, String& result) override;
    bool parseDate(const char16* text, TextDate& result) override;
    bool parseTime(const char16* text, TextTime& result) override;

    void getLocalNow(TextDate& date, TextTime& time) override;
    bool hasDaylightSaving() override;

    void getPreferredLanguages(String& result) override;
    int getMeasurementSystem() override;
};
