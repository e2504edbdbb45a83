#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/text/fstring.h"

/// Takes a text apart at delimiters, which may differ from call to call.
///
///     CmTokens tokens(u"a,,b");
///     tokens.next(u",");      // "a", then "b", then the empty text for ever
///
/// Delimiters side by side count as one, so that no token but the one behind the end is empty. Tokenisers are equal,
/// ordered and hashed by their texts, wherever they stand. One thread at a time.
class CmTokens : public CmObject
{
    DECLARE_CLASS(CmTokens, CmObject)

    CmTokens() : CmTokens(nullptr) {}
    /// Copies the text; null is the empty one.
    explicit CmTokens(const char16* newText);
    /// The copy goes on where the other stands.
    CmTokens(const CmTokens& other);
    CmTokens& operator=(const CmTokens&) = delete;

    /// Begins anew.
    void reset();
    /// The next stretch of characters that don't stand in `delimiters`; null is none. Valid until the next call;
    /// empty at the end of the text.
    const char16* next(const char16* delimiters);
    /// The delimiter behind the last token; 0 where the text ended there.
    char16 getLastDelimiter() const { return lastDelimiter; }
    /// How many characters were gone through. The delimiter behind the last token is not among them.
    int getIndex() const { return index; }

    bool isEqual(const CmObject* other) const override;
    int compare(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;

private:
    FString text;
    const char16* position;
    int index = 0;
    FString token;
    char16 lastDelimiter = 0;
};
