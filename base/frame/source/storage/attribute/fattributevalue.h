#pragma once

#include "foundation/object/cmobject.h"

class CmString;
class ConstString;
class String;

/// The value of one entry in an attribute tree, a message or another list of named values.
///
/// An integer, a double, a text, an object or a bare pointer, told apart by the bits of the type word. What the bits
/// say is held is given back by `empty` and by the next set. A copy has its own text, tree or queue and shares any
/// other object. One thread at a time.
class FAttributeValue : public CmObject
{
    DECLARE_CLASS(FAttributeValue, CmObject)

    /// Bits of the type word. A bare pointer has none of the kinds.
    enum Bits : unsigned
    {
        kInteger = 1,
        kObject = 2,
        kFloat = 4,
        kString = 8,
        /// A text is a plain pointer that must outlive the value; an object got a reference by the value.
        kBorrowed = 16,
        /// The value took over the maker's reference.
        kOwned = 32,
        kUnknown = 256,
        kWide = 512,
        /// With `kBorrowed`: the plain text pointer is 16-bit.
        kBorrowedWide = 1024,
        /// The older archive writes the object anew each time.
        kUnshared = 2048,
        /// What goes into a file.
        kFileMask = kInteger | kObject | kFloat | kString | kUnknown | kWide
    };

    FAttributeValue() = default;
    FAttributeValue(const FAttributeValue& other);
    FAttributeValue& operator=(const FAttributeValue& other);
    ~FAttributeValue() override;

    unsigned getType() const { return type; }
    /// The bits that tell the kind in a file.
    unsigned getKind() const { return type & kFileMask; }
    /// Whether the text is in 16 bits.
    bool isWide() const { return (type & kWide) != 0; }
    /// Gives back what is held; the value is a null pointer then.
    void empty();

    void setLong(long long integer);
    void setFloat(double number);
    void setPointer(void* pointer);
    /// With `kOwned` takes over the caller's reference, with `kBorrowed` adds one, with neither holds none.
    /// Setting the object that is held already does nothing.
    void setObj(CmObject* object, unsigned flags);
    void setUnknown(FUnknown* unknown, unsigned flags);
    /// With `borrow` the text must outlive the value, otherwise it is copied. So in the other forms.
    void setString(const char16* text, bool borrow);
    void setString(const char* text, bool borrow);
    void setString16(const char16* text);
    void setString8(const char* text);
    /// Takes a text of either width.
    void setTString(const ConstString& text, bool borrow);
    /// Takes over the characters of a text, which is empty then.
    void takeString(String& text);

    /// 0 where the value is no number; a double is cut, and held within the range.
    long long getLong() const;
    double getFloat() const;
    bool isNumber() const { return (type & (kInteger | kFloat)) != 0; }
    /// Whether string reads are answered: a text, or an object that is a CmString.
    bool isString() const;
    /// Null where there is no text. The pointer holds until the value is changed or read at another width, which
    /// converts the text in place, with the losses that a String has then.
    const char16* getString() { return getString16(); }
    const char16* getString16();
    const char* getString8();
    /// Copies the text at its width, without converting it; false where there is none.
    bool getString(String& text) const;
    /// A bare pointer, or that to an object or text; null for a number.
    void* getPointer() const;
    /// Borrowed; null where the value is no object.
    CmObject* getObj() const { return type & kObject ? value.object : nullptr; }
    /// Borrowed; null where the value is neither an unknown nor an object.
    FUnknown* getUnknown() const;
    /// Takes the object out: the caller gets the reference that the value held, or a new one if it held none.
    [[nodiscard]] CmObject* detachObj();
    /// Copies a borrowed text.
    void makeStringOwner();

    bool externalize(FArchive& archive) const override;
    bool internalize(FArchive& archive) override;

private:
    void assign(const FAttributeValue& other);
    void setType(unsigned bits) { type = static_cast<uint16>(bits); }
    CmString* ownString() const;
    bool internalizeObject(FArchive& archive, unsigned storedType);
    bool internalizeUnknown(FArchive& archive);
    bool internalizeString(FArchive& archive, unsigned storedType);
    bool internalizeNumber(FArchive& archive, unsigned storedType);

    union
    {
        long long integer = 0;
        double number;
        void* pointer;
        CmObject* object;
        FUnknown* unknown;
        CmString* string;
        const char* text8;
        const char16* text16;
    } value;
    uint16 type = 0;
};
