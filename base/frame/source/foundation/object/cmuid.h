#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/object/fuid.h"

class String;

/// An identifier as an object: a key of dictionaries, an attribute, an element of archives.
///
/// | form           | text                                                                      |
/// |----------------|---------------------------------------------------------------------------|
/// | long           | 32 upper-case hexadecimal digits                                           |
/// | short          | 26 characters, 0 to 9 and A to V: five bits each, least significant first  |
class CmUID : public CmObject, public FUID
{
    DECLARE_CLASS(CmUID, CmObject)

    CmUID() = default;
    explicit CmUID(const FUID& uid) : FUID(uid) {}
    /// Copies 16 raw bytes; a null pointer gives the invalid identifier.
    explicit CmUID(const char* bytes) : FUID(bytes) {}
    CmUID(const CmUID& other) = default;
    CmUID& operator=(const CmUID& other) = default;
    using FUID::operator=;
    bool operator==(const CmUID& other) const { return FUID::operator==(other); }

    /// Writes 32 characters and a terminator.
    void toLongString(char* out) const;
    /// Reads up to 32 digits, two a byte; another character counts as 0, and bytes without digits stay. Always true.
    bool fromLongString(const char* text);
    /// The 32 digits. Defined with the file forms, where String is known.
    void toFString(String& text) const;
    /// Writes 26 characters and a terminator; the result is 26.
    int toShortString(char* out) const;
    /// Reads 26 characters unchecked; what a shorter text lacks is 0. Always true.
    bool fromShortString(const char* text);

    bool isEqual(const CmObject* other) const override;
    int compare(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;
};
