#include "containers/match/cmregularexpression.h"

#include "foundation/object/stringhash.h"

#include <vector>

DEFINE_CLASS(CmRegularExpression, CmObject)

namespace
{
constexpr char16 kAnyText = u'*';
constexpr char16 kAnyCharacter = u'?';
constexpr char16 kLiteral = u'\\';

/// Follows all ways through a pattern at once, so that the time grows with pattern times text and no further,
/// however many stars there are. A place is an index into the pattern; a place that is reached means that the text
/// so far matches the pattern before it.
class PatternWalk
{
public:
    PatternWalk(const char16* expression, unsigned count, bool isCaseSensitive)
        : pattern(expression),
          length(count),
          caseSensitive(isCaseSensitive),
          reached(count + 1),
          next(count + 1)
    {
    }

    bool run(const char16* text, unsigned start)
    {
        reached[start] = true;
        first = start;
        passOptional();
        for (; *text != 0 && first <= length; text++)
            step(fold(*text));
        return reached[length];
    }

private:
    /// Wildcards may stand for nothing.
    void passOptional()
    {
        for (unsigned place = first; place < length; place++)
            if (reached[place] && (pattern[place] == kAnyText || pattern[place] == kAnyCharacter))
                reached[place + 1] = true;
    }

    void step(char16 character)
    {
        next.assign(length + 1, false);
        for (unsigned place = first; place < length; place++)
            if (reached[place])
                takeCharacter(place, character);
        reached.swap(next);
        while (first <= length && !reached[first])
            first++;
        passOptional();
    }

    void takeCharacter(unsigned place, char16 character)
    {
        if (pattern[place] == kAnyText)
        {
            next[place] = true;
            return;
        }
        const bool isEscape = pattern[place] == kLiteral && place + 1 < length;
        const unsigned literal = isEscape ? place + 1 : place;
        if (pattern[place] == kAnyCharacter || fold(pattern[literal]) == character)
            next[literal + 1] = true;
    }

    char16 fold(char16 character) const
    {
        return caseSensitive ? character : ConstString::toLower(character);
    }

    const char16* pattern;
    unsigned length;
    bool caseSensitive;
    std::vector<bool> reached;
    std::vector<bool> next;
    /// No place before this one is reached.
    unsigned first = 0;
};
} // namespace

CmRegularExpression::CmRegularExpression() : CmRegularExpression(nullptr) {}

CmRegularExpression::CmRegularExpression(const char16* text, bool respectsCase)
    : expression(text),
      caseSensitive(respectsCase)
{
}

bool CmRegularExpression::isValidExpression(const char16* expression)
{
    if (!expression)
        return true;
    for (; *expression != 0; expression++)
    {
        if (expression[0] == kAnyText && expression[1] == kAnyText)
            return false;
        if (expression[0] == kLiteral && expression[1] != 0)
            expression++;
    }
    return true;
}

bool CmRegularExpression::match(const char16* text) const
{
    if (isValidExpression(expression.text16()))
        return tryString(text, 0);
    return ConstString(text).compare(expression, caseSensitive ? kCaseSensitive : kCaseInsensitive) == 0;
}

bool CmRegularExpression::tryString(const char16* text, int patternIndex) const
{
    const unsigned length = expression.length();
    const auto start = static_cast<unsigned>(patternIndex);
    const char16* const walkedText = text ? text : kEmptyString16;
    if (start >= length)
        return *walkedText == 0;
    return PatternWalk(expression.text16(), length, caseSensitive).run(walkedText, start);
}

bool CmRegularExpression::isEqual(const CmObject* other) const
{
    const auto* pattern = FCast(CmRegularExpression, other);
    if (!pattern)
        return CmObject::isEqual(other);
    return caseSensitive == pattern->caseSensitive && expression == pattern->expression;
}

unsigned CmRegularExpression::hash(unsigned size) const
{
    return hashString16(expression.text16(), size);
}
