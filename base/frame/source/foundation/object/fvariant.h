#pragma once

#include "foundation/object/funknown.h"

/// A value of one of five kinds in a type word and eight bytes: what crosses interfaces where an object is too much.
///
/// Made from a text or an object it borrows it. Copying and assigning make the target an owner: of a copy of the
/// text, or of a reference on the object. One thread at a time.
class FVariant
{
public:
    /// Bits of the type word.
    enum Type : uint32
    {
        kEmpty = 0,
        kInteger = 1,
        kFloat = 2,
        kString8 = 4,
        kObject = 8,
        kOwner = 16, ///< the variant frees the text or releases the object
        kString16 = 32
    };

    FVariant() = default;
    FVariant(int integer) { setInt(integer); }
    FVariant(unsigned integer) { setInt(integer); }
    FVariant(long integer) { setInt(integer); }
    FVariant(long long integer) { setInt(integer); }
    FVariant(double number) { setFloat(number); }
    FVariant(const char* text) { setString8(text); }
    FVariant(const char16* text) { setString16(text); }
    FVariant(FUnknown* object) { setObject(object); }
    FVariant(const FVariant& other) { assign(other); }
    ~FVariant() { empty(); }
    FVariant& operator=(const FVariant& other);

    /// The kind, without the owner bit.
    uint32 getType() const { return type & ~static_cast<uint32>(kOwner); }
    bool isOwner() const { return (type & kOwner) != 0; }
    bool isString() const { return (type & (kString8 | kString16)) != 0; }
    /// Says whether the variant gives the value back: an owned text is freed with `free`.
    void setOwner(bool isOwned);
    /// Gives back what is owned.
    void empty();

    // The value goes unread where it is of another kind: the result is then 0 or null. A pointer is borrowed.
    int64 getInt() const { return getType() == kInteger ? value.integer : 0; }
    double getFloat() const { return getType() == kFloat ? value.number : 0; }
    const char* getString8() const { return getType() == kString8 ? value.text8 : nullptr; }
    const char16* getString16() const { return getType() == kString16 ? value.text16 : nullptr; }
    FUnknown* getObject() const { return getType() == kObject ? value.object : nullptr; }

    // Texts and objects are borrowed until `setOwner`.
    void setInt(int64 integer);
    void setFloat(double number);
    void setString8(const char* text);
    void setString16(const char16* text);
    void setObject(FUnknown* object);

private:
    void assign(const FVariant& other);

    uint32 type = kEmpty;
    union
    {
        int64 integer;
        double number;
        const char* text8;
        const char16* text16;
        FUnknown* object;
    } value{};
};
