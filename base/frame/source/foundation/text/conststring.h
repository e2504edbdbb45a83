#pragma once

#include "foundation/text/conststringtable.h"
#include "foundation/text/encodings.h"

class FVariant;
class IString;
class IStringResult;
class String;

enum CompareMode
{
    kCaseSensitive,
    kCaseInsensitive
};

/// Sets of characters, by what they are for.
enum CharGroup
{
    kGroupSpace,
    kGroupNotAlphaNum,
    kGroupNotAlpha
};

enum UnicodeNormalization
{
    kUnicodeNormC,
    kUnicodeNormD,
    kUnicodeNormKC,
    kUnicodeNormKD
};

/// A view of a terminated text of 8 or 16 bits a character: the argument type for text everywhere.
///
/// The view owns nothing; what it looks at must outlive it. 16-bit text is UTF-16 whose elements count as
/// characters one by one. 8-bit text is in the default encoding (see encodings.h) where it meets 16-bit text.
/// `text8` and `text16` of a view give the empty text where the width doesn't fit, those of a String convert it.
/// Reading out of range gives a zero character. Immutable, but for what a derived String does.
class ConstString
{
public:
    ConstString() = default;
    ConstString(const char* text);
    ConstString(const char16* text);
    /// The text from `offset` on; an offset past the end gives the empty end, one of 0 or less the whole.
    ConstString(const ConstString& text, int offset);
    /// The text of a variant; empty where the variant holds none.
    ConstString(const FVariant& variant);
    ConstString(const ConstString& other);
    ConstString& operator=(const ConstString& other);

    virtual ~ConstString() = default;
    virtual unsigned length() const { return len; }
    virtual const char* text8() const;
    virtual const char16* text16() const;
    /// The characters at their width; null where there are none.
    virtual const void* text() const { return buffer; }
    virtual const void* ptr() const { return buffer; }
    virtual char getChar8(unsigned index) const;
    virtual char16 getChar16(unsigned index) const;

    bool isEmpty() const { return len == 0; }
    bool isWideString() const { return isWide != 0; }

    // Questions about characters
    /// Out of range, the character is zero.
    bool testChar8(unsigned index, char character) const;
    bool testChar16(unsigned index, char16 character) const;
    bool isDigit(unsigned index) const;
    /// The index of the first of the digits that end the text; -1 if there are none, or not exactly `width` of
    /// them where `width` isn't 0.
    int getTrailingNumberIndex(unsigned width = 0) const;
    bool isAsciiString() const;
    /// Known of wide text and form C only; otherwise false.
    bool isNormalized(UnicodeNormalization form) const;

    // Copying. A negative `count`, or one that is too large, reaches to the end.
    /// False, with `result` as it was, if `index` is at or past the end.
    bool extract(String& result, unsigned index, int count = -1) const;
    /// Copies and terminates; `result` has room for it. Gives the number of characters without the terminator.
    int copyTo8(char* result, unsigned index = 0, int count = -1) const;
    int copyTo16(char16* result, unsigned index = 0, int count = -1) const;
    /// By the width of this text.
    int copyTo(void* result, unsigned index = 0, int count = -1) const;
    void copyTo(IString& result) const;
    void copyTo(IStringResult* result) const;
    /// Lets the variant borrow this text.
    void toVariant(FVariant& variant) const;

    // Comparison: negative, 0 or positive. A negative `count` compares all, another the first `count` characters.
    int compare(const ConstString& text, int count = -1, CompareMode mode = kCaseSensitive) const;
    int compare(const ConstString& text, CompareMode mode) const { return compare(text, -1, mode); }
    /// Compares what stands from `index` on.
    int compareAt(unsigned index, const ConstString& text, int count = -1,
                  CompareMode mode = kCaseSensitive) const;
    /// Digit runs compare by value.
    int naturalCompare(const ConstString& text, CompareMode mode = kCaseSensitive) const;
    /// The index of the first difference; -1 if the texts are equal.
    int getFirstDifferent(const ConstString& text, CompareMode mode = kCaseSensitive) const;

    // Searching: the index or -1. A negative `start` is the first character, or, backwards, the last one.
    // `count` limits how much of `text` counts; `end`, where it isn't negative, is the last index that is tried.
    int findNext(int start, const ConstString& text, int count = -1, CompareMode mode = kCaseSensitive,
                 int end = -1) const;
    int findNext(int start, const ConstString& text, CompareMode mode) const
    {
        return findNext(start, text, -1, mode);
    }
    int findNext(int start, char character, CompareMode mode = kCaseSensitive, int end = -1) const;
    int findNext(int start, char16 character, CompareMode mode = kCaseSensitive, int end = -1) const;
    int findPrev(int start, const ConstString& text, int count = -1, CompareMode mode = kCaseSensitive) const;
    int findPrev(int start, const ConstString& text, CompareMode mode) const
    {
        return findPrev(start, text, -1, mode);
    }
    int findPrev(int start, char character, CompareMode mode = kCaseSensitive) const;
    int findPrev(int start, char16 character, CompareMode mode = kCaseSensitive) const;
    int countOccurences(char character, unsigned start = 0, CompareMode mode = kCaseSensitive) const;
    int countOccurences(char16 character, unsigned start = 0, CompareMode mode = kCaseSensitive) const;

    // Numbers: read by the standard library's formats from `offset`; with `scanToEnd` from the first place where
    // that succeeds. False, with `value` as it was, where there is no number. The 32-bit forms keep the low bits.
    bool scanInt32(int32& value, unsigned offset = 0, bool scanToEnd = true) const;
    bool scanInt64(int64& value, unsigned offset = 0, bool scanToEnd = true) const;
    bool scanUInt32(uint32& value, unsigned offset = 0, bool scanToEnd = true) const;
    bool scanUInt64(uint64& value, unsigned offset = 0, bool scanToEnd = true) const;
    bool scanHex(uint8& value, unsigned offset = 0, bool scanToEnd = true) const;
    /// Takes "," and "." as decimal separator.
    bool scanFloat(double& value, unsigned offset = 0, bool scanToEnd = true) const;

    // Characters. 8-bit ones by the classes of the plain locale. A 16-bit tab or line end is no space.
    static bool isCharSpace(char character);
    static bool isCharSpace(char16 character);
    static bool isCharDigit(char character);
    static bool isCharDigit(char16 character);
    static bool isCharAlpha(char character);
    static bool isCharAlpha(char16 character);
    static bool isCharAlphaNum(char character);
    static bool isCharAlphaNum(char16 character);
    static bool isCharAscii(char character);
    static bool isCharAscii(char16 character);
    static bool isCharUpper(char character);
    static bool isCharUpper(char16 character);
    static bool isCharLower(char character);
    static bool isCharLower(char16 character);
    static char toUpper(char character);
    /// The character itself where its mapping has more than one character.
    static char16 toUpper(char16 character);
    static char toLower(char character);
    static char16 toLower(char16 character);

    /// Case-sensitive, of any two widths.
    friend bool operator==(const ConstString& a, const ConstString& b)
    {
        return (a.len == b.len || a.isWide != b.isWide) && a.compare(b) == 0;
    }
    friend bool operator<(const ConstString& a, const ConstString& b) { return a.compare(b) < 0; }

protected:
    const char* chars8() const { return static_cast<const char*>(buffer); }
    const char16* chars16() const { return static_cast<const char16*>(buffer); }
    /// The number of characters from `index` on that a `count` stands for.
    unsigned clampedCount(unsigned index, int count) const;

    void* buffer = nullptr;
    unsigned len : 30 = 0;
    unsigned isWide : 1 = 0;
    /// Belongs to no operation: who uses it finds it as it was.
    unsigned reserved : 1 = 0;
};
