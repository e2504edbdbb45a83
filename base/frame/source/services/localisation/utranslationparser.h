#pragma once

#include "foundation/text/fstring.h"

class ITranslationReceiver;

/// Reads a translation file that stands in memory, in the new or in the old format. *One thread at a time.*
///
/// A file is in the new format if it starts with the byte order mark of UTF-8 or names that encoding within its first
/// 127 bytes.
class UTranslationParser
{
public:
    /// Both are borrowed.
    UTranslationParser(const char* data, int size, ITranslationReceiver& receiver);

    /// False where the file is damaged or the receiver stopped; what was read until then has been handed over. With
    /// `reportErrors` the user is told where the fault is.
    bool go(bool reportErrors);

    /// What the last failure was and the line, from 1, at which it was found.
    const FString& getMessage() const { return message; }
    int getLine() const { return line; }

private:
    bool isNewFormat() const;
    bool readNew();
    bool readOld();
    void report() const;

    const char* data;
    int size;
    ITranslationReceiver& receiver;
    FString message;
    int line = 0;
};
