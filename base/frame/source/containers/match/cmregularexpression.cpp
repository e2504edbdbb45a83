#include "containers/match/cmregularexpression.h"

#include "foundation/object/stringhash.h"

#include <algorithm>
#include <string>
#include <vector>

DEFINE_CLASS(CmRegularExpression, CmObject)

namespace
{
constexpr char16 kAnyText = u'*';
constexpr char16 kAnyCharacter = u'?';
constexpr char16 kLiteral = u'\\';

/// Follows all ways through a pattern at once, so that no number of stars takes more time than pattern times text. A
/// place is an index into the pattern; a place that is reached means that the text so far matches the pattern
/// before it.
class PatternWalk
{
public:
    PatternWalk(const char16* expression, unsigned count, bool isCaseSensitive)
        : pattern(expression, count),
          length(count),
          caseSensitive(isCaseSensitive),
          reached(count + 1),
          next(count + 1)
    {
        for (char16& character : pattern)
            character = fold(character);
    }

    bool run(const char16* text, unsigned start)
    {
        mark(start);
        reached.swap(next);
        passOptional();
        for (; *text != 0 && first <= last; text++)
            step(fold(*text));
        return first <= last && reached[length];
    }

private:
    void mark(unsigned place)
    {
        next[place] = true;
        first = std::min(first, place);
        last = std::max(last, place);
    }

    /// Wildcards may stand for nothing. Whatever could be done from a place before a star that is reached can be
    /// done from the star, too: those places are given up.
    void passOptional()
    {
        for (unsigned place = first; place <= last && place < length; place++)
        {
            if (!reached[place] || (pattern[place] != kAnyText && pattern[place] != kAnyCharacter))
                continue;
            if (pattern[place] == kAnyText)
                first = place;
            reached[place + 1] = true;
            last = std::max(last, place + 1);
        }
    }

    void step(char16 character)
    {
        const unsigned begin = first, end = last;
        first = length + 1;
        last = 0;
        for (unsigned place = begin; place <= end; place++)
        {
            if (reached[place] && place < length)
                takeCharacter(place, character);
            reached[place] = false;
        }
        reached.swap(next);
        passOptional();
    }

    void takeCharacter(unsigned place, char16 character)
    {
        if (pattern[place] == kAnyText)
            return mark(place);
        const bool isEscape = pattern[place] == kLiteral && place + 1 < length;
        const unsigned literal = isEscape ? place + 1 : place;
        if (pattern[place] == kAnyCharacter || pattern[literal] == character)
            mark(literal + 1);
    }

    char16 fold(char16 character) const
    {
        return caseSensitive ? character : ConstString::toLower(character);
    }

    std::u16string pattern;
    unsigned length;
    bool caseSensitive;
    std::vector<char> reached;
    std::vector<char> next;
    // No place outside these is reached; none at all where the first lies behind the last.
    unsigned first = ~0u;
    unsigned last = 0;
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
    const char16* const pattern = expression.text16();
    const unsigned length = expression.length();
    const auto start = static_cast<unsigned>(patternIndex);
    const char16* const walkedText = text ? text : kEmptyString16;
    if (start >= length)
        return *walkedText == 0;
    return PatternWalk(pattern, length, caseSensitive).run(walkedText, start);
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
