#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/text/fstring.h"

/// A pattern with wildcards.
///
/// | in the pattern | stands for                      |
/// |----------------|---------------------------------|
/// | `*`            | any number of characters        |
/// | `?`            | one character or none           |
/// | `\` and `x`    | the character x itself          |
///
/// Two stars side by side make the pattern invalid; it then matches only the very text that it is. A backslash at
/// the end stands for itself. One thread at a time.
class CmRegularExpression : public CmObject
{
    DECLARE_CLASS(CmRegularExpression, CmObject)

    CmRegularExpression();
    explicit CmRegularExpression(const char16* text, bool respectsCase = true);
    CmRegularExpression(const CmRegularExpression&) = default;
    CmRegularExpression& operator=(const CmRegularExpression&) = default;

    /// Whether the whole text matches. Null is the empty text.
    bool match(const char16* text) const;
    /// Whether `text` matches the pattern from its character `patternIndex` on.
    bool tryString(const char16* text, int patternIndex) const;
    static bool isValidExpression(const char16* expression);

    const char16* getExpression() const { return expression.text16(); }
    bool isCaseSensitive() const { return caseSensitive; }

    bool isEqual(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;

private:
    FString expression;
    bool caseSensitive = true;
};
