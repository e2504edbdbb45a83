#pragma once

#include "foundation/text/charwidth.h"
#include "foundation/text/conststring.h"

#include <cstdarg>
#include <cstring>

class IAttributes;

/// A text that owns its characters and changes their width when it must.
///
/// The buffer comes from `malloc`, which is asked for exactly as much as the text takes; only `refill` keeps a block that
/// is larger. A default String is
/// empty and wide. An empty String takes the width of what is put into it; a narrow one becomes wide when 16-bit
/// text is added; nothing here makes a wide one narrow but `text8`, `toMultiByte` and a new content.
///
/// Beware: `text8`, `text16`, `getChar8` and `getChar16` convert the text in place, const or not, and what the
/// 8-bit encoding can't hold is then lost. So even reading is for one thread at a time. Where memory runs out, the
/// text stays as it was.
class String : public ConstString
{
public:
    String() { isWide = 1; }
    /// `count` and `isTerminated` as in `assign`.
    String(const char* text, int count = -1, bool isTerminated = true);
    String(const char16* text, int count = -1, bool isTerminated = true);
    String(const ConstString& text, int count = -1);
    String(const String& text, int count = -1);
    String(String&& other) noexcept;
    String(const FVariant& variant);
    ~String() override;

    String& operator=(const String& other) { return assign(other); }
    String& operator=(String&& other) noexcept;
    String& operator=(const ConstString& text) { return assign(text); }
    String& operator=(const char* text) { return assign(text); }
    String& operator=(const char16* text) { return assign(text); }

    const char* text8() const override;
    const char16* text16() const override;
    char getChar8(unsigned index) const override;
    char16 getChar16(unsigned index) const override;

    /// Makes room for `newLength` characters of the width; neither sets the length nor converts what is there.
    /// `fill` writes spaces from the present length on. 0 frees the buffer.
    bool resize(unsigned newLength, bool wide, bool fill = false);

    // Content. A negative `count` means all. Without `isTerminated`, exactly `count` characters are taken.
    String& assign(const char* text, int count = -1, bool isTerminated = true);
    String& assign(const char16* text, int count = -1, bool isTerminated = true);
    String& assign(const ConstString& text, int count = -1);
    String& assign(char character, int count = 1);
    String& assign(char16 character, int count = 1);
    /// Gives it `count` narrow characters, none of which is zero or its own. The block stays where it is large enough:
    /// for a text that is filled again and again.
    String& refill(const char* text, unsigned count)
    {
        if (count == 0 || count > len || isWide)
            return refillBlock(text, count);
        memcpy(buffer, text, count);
        static_cast<char*>(buffer)[count] = 0;
        len = count & kMaxTextLength;
        return *this;
    }
    String& append(const char* text, int count = -1);
    String& append(const char16* text, int count = -1);
    String& append(const ConstString& text, int count = -1);
    String& append(char character) { return appendCharacter(character); }
    String& append(char16 character) { return appendCharacter(character); }
    String& append(char character, int count);
    String& append(char16 character, int count);
    String& operator+=(const ConstString& text) { return append(text); }
    /// Past the end nothing happens, but an empty text takes it at any index.
    String& insertAt(unsigned index, const char* text, int count = -1);
    String& insertAt(unsigned index, const char16* text, int count = -1);
    String& insertAt(unsigned index, const ConstString& text, int count = -1);
    String& insertAt(unsigned index, char character) { return insertAt(index, &character, 1, false); }
    String& insertAt(unsigned index, char16 character) { return insertAt(index, &character, 1, false); }
    /// Puts at most `textCount` characters of `text` in the place of `count` characters at `index`.
    String& replace(unsigned index, int count, const char* text, int textCount = -1);
    String& replace(unsigned index, int count, const char16* text, int textCount = -1);
    String& replace(unsigned index, int count, const ConstString& text, int textCount = -1);
    /// Replaces the first occurrence or all, from the left. Gives the number of replacements.
    int replace(const char* from, const char* to, bool all = true);
    int replace(const char16* from, const char16* to, bool all = true);
    String& remove(unsigned index = 0, int count = -1);
    /// Whether the text changed; so do those that follow.
    bool removeSubString(const ConstString& text);
    bool removeChars(CharGroup group);
    bool removeChars8(const char* set);
    bool removeChars16(const char16* set);
    bool replaceChars8(const char* set, char character);
    bool replaceChars16(const char16* set, char16 character);
    bool trim(CharGroup group = kGroupSpace);
    /// Past the end the text grows by spaces; a zero character ends the text there.
    bool setChar8(unsigned index, char character);
    bool setChar16(unsigned index, char16 character);
    /// Adds one to the number at the end, or begins one with 1. It gets at least `width` digits, is at least
    /// `minNumber`, and stands behind `separator` unless that is 0 or nothing else is there.
    ///
    ///     text     width  separator  minNumber  result
    ///     Take 9   0      ' '        0          Take 10
    ///     Take     0      ' '        2          Take 2
    ///     Take     3      ' '        2          Take 002
    ///     Take     0      0          0          Take1
    ///
    /// False, with the text as it was, for a width above 32.
    bool incrementTrailingNumber(unsigned width = 0, char16 separator = 0, unsigned minNumber = 0);

    // Width, case and form
    /// In place. Characters that can't be converted become " ", or "?" in the 8-bit form. On failure false.
    bool toWideString(unsigned encoding = kEncodingDefault);
    /// A narrow text is taken to be in the default encoding where another one is asked for.
    bool toMultiByte(unsigned encoding = kEncodingDefault);
    /// Gives the wide text of these bytes in UTF-8.
    bool fromUTF8(const char* text);
    using ConstString::toLower;
    using ConstString::toUpper;
    void toLower();
    void toUpper();
    void toLower(unsigned index);
    void toUpper(unsigned index);
    /// False for narrow text.
    bool normalize(UnicodeNormalization form);

    // Numbers and formats. At most 4096 characters are kept; in a 16-bit format "%s" means 16-bit text.
    String& printf(const char* format, ...);
    String& printf(const char16* format, ...);
    String& vprintf(const char* format, va_list arguments);
    String& vprintf(const char16* format, va_list arguments);
    String& printInt64(int64 value);
    /// With at least one digit behind the point and no more than six.
    String& printFloat(double value);

    // Handing over
    /// False, and empty, for a variant that is no number and no text.
    bool fromVariant(const FVariant& variant);
    /// The variant owns the characters thereafter; this text is empty.
    void passToVariant(FVariant& variant);
    bool toAttributes(IAttributes* attributes, const char* id) const;
    bool fromAttributes(IAttributes* attributes, const char* id);
    /// Adopts a `malloc`ed, terminated text.
    void take(void* text, bool wide);
    /// The same where the length is known.
    void take(void* text, bool wide, unsigned newLength);
    void take(String& other);
    /// Gives up the characters: the caller frees them with `free`. May be null.
    void* pass();
    void swapContent(String& other);
    /// After the buffer was written directly.
    void updateLength();
    /// The first byte is the length, at most 255; `result` has room for 256 bytes.
    void toPascalString(unsigned char* result) const;
    String& fromPascalString(const unsigned char* text);

private:
    template <class Char>
    Char* chars()
    {
        return static_cast<Char*>(buffer);
    }
    using ConstString::chars16;
    using ConstString::chars8;
    char* chars8() { return chars<char>(); }
    char16* chars16() { return chars<char16>(); }

    String& refillBlock(const char* text, unsigned count);
    /// Brings a narrow text from the default encoding into another one.
    bool recode(unsigned encoding);
    /// Takes the wide form of bytes that may be those of this text.
    bool takeWide(const char* text, unsigned length, unsigned encoding);
    bool owns(const void* text) const;
    void terminate(unsigned index);
    void fillWith(char character, unsigned index, unsigned count);
    /// Cuts the text and gives back the room.
    void shrink(unsigned newLength);

    // What both widths share; where a text is changed in part, it has the width of `Char`.
    template <class Char>
    String& assignText(const Char* text, int count, bool isTerminated);
    template <class Char>
    String& assignRun(Char character, int count);
    template <class Char>
    String& appendCharacter(Char character);
    template <class Char>
    String& appendRun(Char character, int count);
    template <class Char>
    String& appendText(const Char* text, unsigned count);
    /// Lets the text, which has this width, be longer by as many characters; gives the place of the first of them.
    template <class Char>
    Char* extend(unsigned count);
    /// Lets the buffer have at least as many bytes. Blocks come in steps of some bytes: one that is large enough as it
    /// is would come back unchanged.
    bool enlarge(std::size_t size) { return size <= blockSizeOf(buffer) || reallocate(size); }
    bool reallocate(std::size_t size);
    template <class Char>
    String& splice(unsigned index, unsigned removed, const Char* text, unsigned count);
    template <class Char>
    int replaceAll(const Char* from, unsigned fromLength, const Char* to, unsigned toLength, bool all);
    template <class Char, class Predicate>
    bool removeIf(Predicate isUnwanted);
    template <class Char>
    bool replaceIf(const Char* set, Char character);
    template <class Char>
    bool trimText(CharGroup group);
    template <class Char>
    bool setCharacter(unsigned index, Char character);
    String& insertAt(unsigned index, const char* text, int count, bool isTerminated);
    String& insertAt(unsigned index, const char16* text, int count, bool isTerminated);
};

template <class Char>
Char* String::extend(unsigned count)
{
    const std::size_t newLength = std::size_t{len} + count;
    if (newLength > kMaxTextLength || !enlarge((newLength + 1) * sizeof(Char)))
        return nullptr;
    Char* place = chars<Char>() + len;
    place[count] = 0;
    len = static_cast<unsigned>(newLength) & kMaxTextLength;
    return place;
}

/// The plain case by itself: texts are often put together character by character, and most of them fit the block as it
/// is.
template <class Char>
String& String::appendCharacter(Char character)
{
    const bool isPlain = character != 0 && len > 0 && charSize(isWide) == sizeof(Char);
    if (!isPlain)
        return append(character, 1);
    if (Char* place = extend<Char>(1))
        *place = character;
    return *this;
}
