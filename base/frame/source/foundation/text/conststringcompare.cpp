#include "foundation/object/wordat.h"
#include "foundation/text/charwidth.h"
#include "foundation/text/conststring.h"
#include "foundation/text/itextservices.h"
#include "foundation/text/natcompare.h"
#include "foundation/text/string.h"

#include <algorithm>
#include <bit>
#include <cstring>

namespace
{
/// The text in 16 bits: itself, or a copy of it where it is narrow.
class WideText
{
public:
    explicit WideText(const ConstString& text) : view(text)
    {
        if (!text.isWideString())
            view = copy.assign(text).text16();
    }

    const ConstString& get() const { return view; }

private:
    String copy;
    ConstString view;
};

int compareFolded(const char* a, const char* b, std::size_t limit)
{
    for (std::size_t i = 0; i < limit; ++i)
    {
        const auto x = static_cast<unsigned char>(ConstString::toLower(a[i]));
        const auto y = static_cast<unsigned char>(ConstString::toLower(b[i]));
        if (x != y || x == 0)
            return x - y;
    }
    return 0;
}

int compareNarrow(const char* a, const char* b, int count, CompareMode mode)
{
    const std::size_t limit = count < 0 ? kMaxTextLength : static_cast<std::size_t>(count);
    return mode == kCaseSensitive ? std::strncmp(a, b, limit) : compareFolded(a, b, limit);
}

/// The place of the first of four characters that differs.
unsigned firstDifferentOfFour(uint64 difference)
{
    const int zeroBits = std::endian::native == std::endian::little ? std::countr_zero(difference)
                                                                    : std::countl_zero(difference);
    return static_cast<unsigned>(zeroBits) / 16;
}

/// The place of the first difference in `count` characters; `count` where there is none.
unsigned firstDifference(const char16* a, const char16* b, unsigned count)
{
    constexpr unsigned kStep = 4;
    if (count < kStep)
        return static_cast<unsigned>(std::mismatch(a, a + count, b).first - a);
    const unsigned lastStep = count - kStep;
    for (unsigned i = 0;; i = std::min(i + kStep, lastStep))
    {
        if (const uint64 difference = wordAt(a + i) ^ wordAt(b + i))
            return i + firstDifferentOfFour(difference);
        if (i == lastStep)
            return count;
    }
}

int compareExactly(const char16* a, unsigned lengthA, const char16* b, unsigned lengthB)
{
    const unsigned same = firstDifference(a, b, std::min(lengthA, lengthB));
    if (same < lengthA && same < lengthB)
        return a[same] - b[same];
    if (lengthA == lengthB)
        return 0;
    return lengthA < lengthB ? -1 : a[same];
}

/// `lengthA` and `lengthB` are cut to the limit of the comparison.
int compareWide(const char16* a, unsigned lengthA, const char16* b, unsigned lengthB, CompareMode mode)
{
    return mode == kCaseSensitive ? compareExactly(a, lengthA, b, lengthB)
                                  : ITextServices::instance().compareIgnoringCase(a, lengthA, b, lengthB);
}

bool isSameCharacter(char a, char b, CompareMode mode)
{
    return a == b || (mode == kCaseInsensitive && ConstString::toUpper(a) == ConstString::toUpper(b));
}

bool isSameCharacter(char16 a, char16 b, CompareMode mode)
{
    return a == b || (mode == kCaseInsensitive && ConstString::toUpper(a) == ConstString::toUpper(b));
}

template <class Char>
int findDifference(std::basic_string_view<Char> a, std::basic_string_view<Char> b, CompareMode mode)
{
    const auto isSame = [mode](Char x, Char y) { return isSameCharacter(x, y, mode); };
    const auto place = std::mismatch(a.begin(), a.end(), b.begin(), b.end(), isSame);
    if (place.first == a.end() && place.second == b.end())
        return -1;
    return static_cast<int>(place.first - a.begin());
}

/// The first place of `what` at or behind `start`, of which `last` is the last one that counts.
template <class Char>
int searchForward(std::basic_string_view<Char> text, int start, std::basic_string_view<Char> what,
                  CompareMode mode, int last)
{
    const auto from = static_cast<std::size_t>(std::max(start, 0));
    if (what.empty() || from >= text.size())
        return -1;
    if (last >= 0)
        text = text.substr(0, std::min(text.size(), static_cast<std::size_t>(last) + what.size()));
    if (from >= text.size())
        return -1;
    if (mode == kCaseSensitive)
    {
        const std::size_t place = text.find(what, from);
        return place == text.npos ? -1 : static_cast<int>(place);
    }
    const auto isSame = [](Char x, Char y) { return isSameCharacter(x, y, kCaseInsensitive); };
    const auto place = std::search(text.begin() + static_cast<std::ptrdiff_t>(from), text.end(), what.begin(),
                                   what.end(), isSame);
    return place == text.end() ? -1 : static_cast<int>(place - text.begin());
}

/// The last place of `what` at or before `start`.
template <class Char>
int searchBackward(std::basic_string_view<Char> text, int start, std::basic_string_view<Char> what,
                   CompareMode mode)
{
    if (what.empty() || text.size() < what.size())
        return -1;
    const std::size_t lastFit = text.size() - what.size();
    const std::size_t from = start < 0 ? lastFit : std::min(lastFit, static_cast<std::size_t>(start));
    const auto isSame = [mode](Char x, Char y) { return isSameCharacter(x, y, mode); };
    for (std::size_t place = from + 1; place-- > 0;)
        if (std::equal(what.begin(), what.end(), text.begin() + static_cast<std::ptrdiff_t>(place), isSame))
            return static_cast<int>(place);
    return -1;
}

std::string_view narrowView(const ConstString& text)
{
    return {text.text8(), text.length()};
}

std::u16string_view wideView(const ConstString& text)
{
    return {text.text16(), text.length()};
}

/// Calls `search` with both texts in one width, and `what` cut to `count` characters.
template <class Search>
int searchInOneWidth(const ConstString& text, const ConstString& what, int count, Search search)
{
    const std::size_t limit = count < 0 ? kMaxTextLength : static_cast<std::size_t>(count);
    if (text.isEmpty() || what.isEmpty() || limit == 0)
        return -1;
    if (!text.isWideString() && !what.isWideString())
        return search(narrowView(text), narrowView(what).substr(0, limit));
    const WideText wideText(text), wideWhat(what);
    return search(wideView(wideText.get()), wideView(wideWhat.get()).substr(0, limit));
}

int countInOneWidth(const ConstString& text, const ConstString& character, unsigned start, CompareMode mode)
{
    const int found = searchInOneWidth(
        text, character, 1,
        [=](auto whole, auto what)
        {
            const auto isWanted = [=](auto each) { return isSameCharacter(each, what[0], mode); };
            whole.remove_prefix(std::min<std::size_t>(start, whole.size()));
            return static_cast<int>(std::count_if(whole.begin(), whole.end(), isWanted));
        });
    return std::max(found, 0);
}
} // namespace

// Comparison

int ConstString::compare(const ConstString& text, int count, CompareMode mode) const
{
    // Most texts are wide and most comparisons whole.
    if (isWide && text.isWide && count < 0 && mode == kCaseSensitive && text.len > 0)
        return compareExactly(chars16(), len, text.chars16(), text.len);
    if (count == 0)
        return 0;
    if (text.isEmpty())
        return isEmpty() ? 0 : 1;
    return compareAt(0, text, count, mode);
}

int ConstString::compareAt(unsigned index, const ConstString& text, int count, CompareMode mode) const
{
    if (index >= len)
        return text.isEmpty() ? 0 : -1;
    if (count == 0)
        return 0;
    if (text.isEmpty())
        return 1;
    if (!isWide && !text.isWide)
        return compareNarrow(chars8() + index, text.chars8(), count, mode);
    if (isWide && text.isWide)
        return compareWide(chars16() + index, clampedCount(index, count), text.chars16(),
                           text.clampedCount(0, count), mode);
    const ConstString rest(*this, static_cast<int>(index));
    const WideText wideRest(rest), wideText(text);
    const ConstString& a = wideRest.get();
    const ConstString& b = wideText.get();
    return compareWide(a.chars16(), a.clampedCount(0, count), b.chars16(), b.clampedCount(0, count), mode);
}

int ConstString::naturalCompare(const ConstString& text, CompareMode mode) const
{
    if (text.isEmpty())
        return isEmpty() ? 0 : 1;
    if (isEmpty())
        return -1;
    const bool caseSensitive = mode == kCaseSensitive;
    if (!isWide && !text.isWide)
        return strnatcmp8(chars8(), text.chars8(), caseSensitive);
    const WideText a(*this), b(text);
    return strnatcmp16(a.get().chars16(), b.get().chars16(), caseSensitive);
}

int ConstString::getFirstDifferent(const ConstString& text, CompareMode mode) const
{
    if (!isWide && !text.isWide)
        return findDifference(std::string_view(ConstString::text8(), len),
                              std::string_view(text.ConstString::text8(), text.len), mode);
    const WideText a(*this), b(text);
    return findDifference(wideView(a.get()), wideView(b.get()), mode);
}

// Searching

int ConstString::findNext(int start, const ConstString& text, int count, CompareMode mode, int end) const
{
    return searchInOneWidth(*this, text, count,
                            [=](auto whole, auto what)
                            { return searchForward(whole, start, what, mode, end); });
}

int ConstString::findPrev(int start, const ConstString& text, int count, CompareMode mode) const
{
    return searchInOneWidth(*this, text, count,
                            [=](auto whole, auto what) { return searchBackward(whole, start, what, mode); });
}

int ConstString::findNext(int start, char character, CompareMode mode, int end) const
{
    if (isWide)
        return findNext(start, widenCharacter(character), mode, end);
    const char text[] = {character, 0};
    return findNext(start, ConstString(text), 1, mode, end);
}

int ConstString::findNext(int start, char16 character, CompareMode mode, int end) const
{
    const char16 text[] = {character, 0};
    return findNext(start, ConstString(text), 1, mode, end);
}

int ConstString::findPrev(int start, char character, CompareMode mode) const
{
    if (isWide)
        return findPrev(start, widenCharacter(character), mode);
    const char text[] = {character, 0};
    return findPrev(start, ConstString(text), 1, mode);
}

int ConstString::findPrev(int start, char16 character, CompareMode mode) const
{
    const char16 text[] = {character, 0};
    return findPrev(start, ConstString(text), 1, mode);
}

int ConstString::countOccurences(char character, unsigned start, CompareMode mode) const
{
    if (isWide)
        return countOccurences(widenCharacter(character), start, mode);
    const char text[] = {character, 0};
    return countInOneWidth(*this, ConstString(text), start, mode);
}

int ConstString::countOccurences(char16 character, unsigned start, CompareMode mode) const
{
    const char16 text[] = {character, 0};
    return countInOneWidth(*this, ConstString(text), start, mode);
}
