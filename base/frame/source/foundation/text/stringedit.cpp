#include "foundation/text/charwidth.h"
#include "foundation/text/string.h"

#include <algorithm>
#include <cctype>
#include <cstdlib>
#include <cstring>
#include <cwctype>
#include <functional>

namespace
{
template <class Char>
constexpr bool kIsWide = sizeof(Char) == sizeof(char16);

template <class Char>
unsigned countedLength(const Char* text, int count)
{
    return count < 0 ? measureText(text) : measureText(text, static_cast<unsigned>(count));
}

bool isInGroup(char character, CharGroup group)
{
    const int value = static_cast<unsigned char>(character);
    switch (group)
    {
    case kGroupSpace:
        return std::isspace(value) != 0;
    case kGroupNotAlphaNum:
        return std::isalnum(value) == 0;
    default:
        return std::isalpha(value) == 0;
    }
}

bool isInGroup(char16 character, CharGroup group)
{
    const auto value = static_cast<std::wint_t>(character);
    switch (group)
    {
    case kGroupSpace:
        return std::iswspace(value) != 0;
    case kGroupNotAlphaNum:
        return std::iswalnum(value) == 0;
    default:
        return std::iswalpha(value) == 0;
    }
}

template <class Char>
bool isInSet(Char character, const Char* set)
{
    return std::char_traits<Char>::find(set, measureText(set), character) != nullptr;
}

String widenSet(const char* set)
{
    String wide(set);
    wide.toWideString();
    return wide;
}
} // namespace

// Shared by both widths

bool String::owns(const void* text) const
{
    if (!buffer)
        return false;
    const std::less<const void*> isBefore;
    const char* end = chars8() + (std::size_t{len} + 1) * charSize(isWide);
    return !isBefore(text, buffer) && isBefore(text, end);
}

template <class Char>
String& String::assignText(const Char* text, int count, bool isTerminated)
{
    if ((buffer && text == buffer) || (!isTerminated && count < 0))
        return *this;
    if (owns(text))
    {
        String copy(text, count, isTerminated);
        take(copy);
        return *this;
    }
    const unsigned newLength = countedLength(text, count);
    const bool fits = newLength > 0 && newLength == len && isWide == kIsWide<Char>;
    if (!fits && (!resize(newLength, kIsWide<Char>) || newLength == 0))
        return *this;
    std::memcpy(buffer, text, newLength * sizeof(Char));
    len = newLength & kMaxTextLength;
    chars<Char>()[newLength] = 0;
    return *this;
}

template <class Char>
String& String::assignRun(Char character, int count)
{
    const unsigned newLength = character == 0 || count < 0 ? 0 : static_cast<unsigned>(count);
    if (!resize(newLength, kIsWide<Char>) || newLength == 0)
        return *this;
    std::fill_n(chars<Char>(), newLength, character);
    len = newLength & kMaxTextLength;
    terminate(newLength);
    return *this;
}

template <class Char>
String& String::appendRun(Char character, int count)
{
    if (character == 0 || count <= 0)
        return *this;
    if (Char* place = extend<Char>(static_cast<unsigned>(count)))
        for (int i = 0; i < count; ++i)
            place[i] = character;
    return *this;
}

template <class Char>
String& String::appendText(const Char* text, unsigned count)
{
    // A text that is part of this one moves with it.
    const bool isOwn = owns(text);
    const std::size_t offset = isOwn ? static_cast<std::size_t>(text - chars<Char>()) : 0;
    if (count == 0)
        return *this;
    if (Char* place = extend<Char>(count))
        std::memcpy(place, isOwn ? chars<Char>() + offset : text, count * sizeof(Char));
    return *this;
}

template <class Char>
String& String::splice(unsigned index, unsigned removed, const Char* text, unsigned count)
{
    if (removed == 0 && count == 0)
        return *this;
    if (owns(text))
    {
        const String copy(text, static_cast<int>(count), false);
        return splice(index, removed, static_cast<const Char*>(copy.text()), copy.length());
    }
    const unsigned newLength = len - removed + count;
    if (newLength > len && !resize(newLength, isWide))
        return *this;
    Char* place = chars<Char>() + index;
    std::memmove(place + count, place + removed, (len - index - removed) * sizeof(Char));
    if (count > 0)
        std::memcpy(place, text, count * sizeof(Char));
    len = newLength & kMaxTextLength;
    terminate(newLength);
    return *this;
}

template <class Char>
int String::replaceAll(const Char* from, unsigned fromLength, const Char* to, unsigned toLength, bool all)
{
    using View = std::basic_string_view<Char>;
    const View text(chars<Char>(), len), wanted(from, fromLength), put(to, toLength);
    if (wanted.empty())
        return 0;
    std::size_t found = 0;
    for (std::size_t at = text.find(wanted); at != View::npos && (all || found == 0);
         at = text.find(wanted, at + wanted.size()))
        ++found;
    const std::size_t newLength = text.size() - found * wanted.size() + found * put.size();
    if (found == 0 || newLength > kMaxTextLength)
        return 0;

    auto* made = static_cast<Char*>(std::malloc((newLength + 1) * sizeof(Char)));
    if (!made)
        return 0;
    Char* out = made;
    std::size_t done = 0;
    for (std::size_t i = 0; i < found; ++i)
    {
        const std::size_t at = text.find(wanted, done);
        out = std::copy(text.begin() + done, text.begin() + at, out);
        out = std::copy(put.begin(), put.end(), out);
        done = at + wanted.size();
    }
    out = std::copy(text.begin() + done, text.end(), out);
    *out = 0;
    take(made, kIsWide<Char>);
    return static_cast<int>(found);
}

template <class Char, class Predicate>
bool String::removeIf(Predicate isUnwanted)
{
    Char* begin = chars<Char>();
    const Char* end = std::remove_if(begin, begin + len, isUnwanted);
    const auto newLength = static_cast<unsigned>(end - begin);
    if (newLength == len)
        return false;
    shrink(newLength);
    return true;
}

template <class Char>
bool String::replaceIf(const Char* set, Char character)
{
    const auto isWanted = [set](Char each) { return isInSet(each, set); };
    Char* begin = chars<Char>();
    if (std::none_of(begin, begin + len, isWanted))
        return false;
    std::replace_if(begin, begin + len, isWanted, character);
    if (character == 0)
        updateLength();
    return true;
}

template <class Char>
bool String::trimText(CharGroup group)
{
    const Char* text = chars<Char>();
    unsigned first = 0;
    unsigned last = len;
    while (first < last && isInGroup(text[first], group))
        ++first;
    while (last > first && isInGroup(text[last - 1], group))
        --last;
    if (last - first == len)
        return false;
    std::memmove(buffer, text + first, (last - first) * sizeof(Char));
    shrink(last - first);
    return true;
}

template <class Char>
bool String::setCharacter(unsigned index, Char character)
{
    if (index >= kMaxTextLength)
        return false;
    if (index >= len)
    {
        if (!resize(index + 1, kIsWide<Char>, true))
            return false;
        len = (index + 1) & kMaxTextLength;
        terminate(len);
    }
    chars<Char>()[index] = character;
    if (character == 0)
        shrink(index);
    return true;
}

// Content

String& String::assign(const char* text, int count, bool isTerminated)
{
    return assignText(text, count, isTerminated);
}

String& String::assign(const char16* text, int count, bool isTerminated)
{
    return assignText(text, count, isTerminated);
}

String& String::assign(const ConstString& text, int count)
{
    return text.isWideString() ? assign(text.text16(), count) : assign(text.text8(), count);
}

String& String::assign(char character, int count)
{
    return assignRun(character, count);
}

String& String::assign(char16 character, int count)
{
    return assignRun(character, count);
}

String& String::refillBlock(const char* text, unsigned count)
{
    const bool fits = count > 0 && count < blockSizeOf(buffer);
    if (!fits && (!resize(count, false) || count == 0))
        return *this;
    std::memcpy(buffer, text, count);
    isWide = 0;
    len = count & kMaxTextLength;
    chars8()[count] = 0;
    return *this;
}

String& String::append(const char* text, int count)
{
    return insertAt(len, text, count, true);
}

String& String::append(const char16* text, int count)
{
    return insertAt(len, text, count, true);
}

String& String::append(const ConstString& text, int count)
{
    return insertAt(len, text, count);
}

String& String::append(char character, int count)
{
    if (isEmpty())
        return assign(character, count);
    return isWide ? appendRun(widenCharacter(character), count) : appendRun(character, count);
}

String& String::append(char16 character, int count)
{
    if (isEmpty())
        return assign(character, count);
    return isWide || toWideString() ? appendRun(character, count) : *this;
}

String& String::insertAt(unsigned index, const char* text, int count)
{
    return insertAt(index, text, count, true);
}

String& String::insertAt(unsigned index, const char16* text, int count)
{
    return insertAt(index, text, count, true);
}

String& String::insertAt(unsigned index, const ConstString& text, int count)
{
    return text.isWideString() ? insertAt(index, text.text16(), count) : insertAt(index, text.text8(), count);
}

String& String::insertAt(unsigned index, const char* text, int count, bool isTerminated)
{
    if (isEmpty())
        return text ? assign(text, count, isTerminated) : *this;
    if (!text || index > len)
        return *this;
    if (!isWide && index == len)
        return appendText(text, countedLength(text, count));
    if (!isWide)
        return splice(index, 0, text, countedLength(text, count));
    String wide(text, count);
    if (!wide.toWideString())
        return *this;
    return splice(index, 0, wide.text16(), wide.length());
}

String& String::insertAt(unsigned index, const char16* text, int count, bool isTerminated)
{
    if (isEmpty())
        return text ? assign(text, count, isTerminated) : *this;
    if (!text || index > len || !(isWide || toWideString()))
        return *this;
    if (index == len)
        return appendText(text, countedLength(text, count));
    return splice(index, 0, text, countedLength(text, count));
}

String& String::replace(unsigned index, int count, const char* text, int textCount)
{
    if (!text || index > len || count == 0)
        return *this;
    if (isEmpty())
        return assign(text, textCount);
    const unsigned removed = clampedCount(index, count);
    if (!isWide)
        return splice(index, removed, text, countedLength(text, textCount));
    String wide(text, textCount);
    if (!wide.toWideString())
        return *this;
    return splice(index, removed, wide.text16(), wide.length());
}

String& String::replace(unsigned index, int count, const char16* text, int textCount)
{
    if (!text || index > len || count == 0)
        return *this;
    if (isEmpty())
        return assign(text, textCount);
    if (!toWideString())
        return *this;
    return splice(index, clampedCount(index, count), text, countedLength(text, textCount));
}

String& String::replace(unsigned index, int count, const ConstString& text, int textCount)
{
    return text.isWideString() ? replace(index, count, text.text16(), textCount)
                               : replace(index, count, text.text8(), textCount);
}

int String::replace(const char* from, const char* to, bool all)
{
    if (!from || !to || isEmpty())
        return 0;
    if (!isWide)
        return replaceAll(from, measureText(from), to, measureText(to), all);
    String wideFrom(from), wideTo(to);
    if (!wideFrom.toWideString() || !wideTo.toWideString())
        return 0;
    return replaceAll(wideFrom.text16(), wideFrom.length(), wideTo.text16(), wideTo.length(), all);
}

int String::replace(const char16* from, const char16* to, bool all)
{
    if (!from || !to || isEmpty() || !toWideString())
        return 0;
    return replaceAll(from, measureText(from), to, measureText(to), all);
}

String& String::remove(unsigned index, int count)
{
    const unsigned removed = clampedCount(index, count);
    if (removed == 0)
        return *this;
    char* place = chars8() + index * charSize(isWide);
    std::memmove(place, place + removed * charSize(isWide), (len - index - removed) * charSize(isWide));
    shrink(len - removed);
    return *this;
}

bool String::removeSubString(const ConstString& text)
{
    const int found =
        text.isWideString() ? replace(text.text16(), u"", true) : replace(text.text8(), "", true);
    return found > 0;
}

// Single characters

bool String::removeChars(CharGroup group)
{
    const auto isUnwanted = [group](auto character) { return isInGroup(character, group); };
    return isWide ? removeIf<char16>(isUnwanted) : removeIf<char>(isUnwanted);
}

bool String::removeChars8(const char* set)
{
    if (!set || isEmpty())
        return false;
    if (isWide)
        return removeChars16(widenSet(set).text16());
    return removeIf<char>([set](char character) { return isInSet(character, set); });
}

bool String::removeChars16(const char16* set)
{
    if (!set || isEmpty() || !toWideString())
        return false;
    return removeIf<char16>([set](char16 character) { return isInSet(character, set); });
}

bool String::replaceChars8(const char* set, char character)
{
    if (!set || isEmpty())
        return false;
    if (isWide)
        return replaceChars16(widenSet(set).text16(), widenCharacter(character));
    return replaceIf<char>(set, character);
}

bool String::replaceChars16(const char16* set, char16 character)
{
    if (!set || isEmpty() || !toWideString())
        return false;
    return replaceIf<char16>(set, character);
}

bool String::trim(CharGroup group)
{
    return isWide ? trimText<char16>(group) : trimText<char>(group);
}

bool String::setChar8(unsigned index, char character)
{
    if (isWide && !isEmpty())
        return setCharacter(index, widenCharacter(character));
    return setCharacter(index, character);
}

bool String::setChar16(unsigned index, char16 character)
{
    return toWideString() && setCharacter(index, character);
}
