#pragma once

#include "foundation/object/cmobject.h"

class FVariant;
class String;

/// A value that is an integer, a number with fraction, a text of either width, an object, or nothing.
///
/// Texts and objects are borrowed or owned. A borrowed one must outlive the variant or be made its own by
/// `emancipate`; a copy of a variant always owns. One thread at a time.
class CmVariant : public CmObject
{
    DECLARE_CLASS(CmVariant, CmObject)

    CmVariant() = default;
    explicit CmVariant(int number);
    explicit CmVariant(int64 number);
    explicit CmVariant(double number);
    CmVariant(const char16* text, bool copy);
    /// Copies a text, adds a reference to an object.
    CmVariant(const FVariant& other);
    CmVariant(const CmVariant& other);
    ~CmVariant() override;
    CmVariant& operator=(const CmVariant& other);
    CmVariant& operator=(const FVariant& other);
    CmVariant& operator=(int number);
    CmVariant& operator=(int64 number);
    CmVariant& operator=(double number);

    // What it holds

    bool isEmpty() const { return (type & kKindMask) == 0; }
    bool isInteger() const { return (type & kInteger) != 0; }
    bool isFloat() const { return (type & kFloat) != 0; }
    bool isString() const { return (type & (kText8 | kText16)) != 0; }
    bool isObject() const { return (type & kObject) != 0; }
    bool isOwner() const { return (type & kOwner) != 0; }

    // Reading. A number is read from a number of the other kind or from the beginning of a text

    /// 0 where it holds no number; a fraction is cut off, a number beyond 64 bits becomes the nearest there is.
    int64 getLong() const;
    double getFloat() const;
    /// Numbers are printed. False and an empty text for an object or nothing.
    bool getString(String& result) const;
    /// The object, borrowed, if it is one of that class or derived from it; else null.
    CmObject* getObject(const char* className) const;
    FUnknown* getUnknown() const;

    // Setting. A null text or object leaves the variant empty

    void setLong(int64 number);
    void setFloat(double number);
    /// Without `copy` the text is borrowed.
    void setString(const char16* text, bool copy);
    void setString8(const char* text, bool copy);
    void setString16(const char16* text, bool copy) { setString(text, copy); }
    /// The object is borrowed.
    void setUnknown(FUnknown* object);

    /// Copies a text, adds a reference to an object.
    void assign(const FVariant& other);
    /// The target owns a copy of the text or a reference to the object.
    void assignTo(FVariant& target) const;
    /// A variant that borrows what this one holds.
    operator FVariant() const;

    // Ownership

    /// Says whether the destructor frees the text, which must then come from `malloc`, or releases the object; a
    /// variant of numbers owns nothing.
    void setOwner(bool owner);
    void empty();
    /// Makes a borrowed text or object owned: a copy, an added reference.
    void emancipate();

    /// Negative, 0 or positive. Nothing sorts before numbers, these before texts, these before objects. Numbers
    /// compare by value and texts case-sensitively, whatever their width; objects by CmObject::compare, others by
    /// address.
    static int compareVariants(const FVariant& left, const FVariant& right);

    bool operator==(const CmVariant& other) const;

    bool isEqual(const CmObject* other) const override;
    int compare(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;

private:
    void assignObject(FUnknown* object);
    bool restoreText(FAttributes& attributes, bool isWide);

    // The numbers are kept in files.
    enum Type : uint32
    {
        kInteger = 1,
        kFloat = 2,
        kText8 = 4,
        kText16 = 8,
        kObject = 16,
        kKindMask = 31,
        kOwner = 32
    };

    uint32 type = 0;
    union Value
    {
        int64 number;
        double real;
        const char* text8;
        const char16* text16;
        FUnknown* object;
    } value{};
};
