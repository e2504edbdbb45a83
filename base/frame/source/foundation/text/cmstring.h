#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/object/istring.h"
#include "foundation/text/fstring.h"

class CmContainer;

/// A text as an object: for containers, archives and attributes.
///
/// Texts are equal, ordered and hashed by their characters; equal texts of different width have different hashes,
/// so settle on one width in a table. One thread at a time.
class CmString : public CmObject, public FString, public IStringResult, public IString
{
    DECLARE_CLASS(CmString, CmObject)

    using FString::FString;
    using FString::operator=;
    CmString() = default;
    CmString(const CmString&) = default;
    CmString& operator=(const CmString&) = default;

    using FString::compare;
    using FString::take;

    /// Cuts `text` at each delimiter and adds the pieces as CmStrings to `result`, which owns them.
    /// Empty pieces are dropped, but for the last one, which is kept unless `dropEmptyLast`. `trim` cuts white
    /// space off each piece. Gives the size of `result`.
    static int split(const ConstString& text, CmContainer& result, const ConstString& delimiter,
                     bool trim = false, bool dropEmptyLast = true);
    static int split8(const char* text, CmContainer& result, const char* delimiter, bool trim = false,
                      bool dropEmptyLast = true);
    static int split16(const char16* text, CmContainer& result, const char16* delimiter, bool trim = false,
                       bool dropEmptyLast = true);

    bool isEqual(const CmObject* other) const override;
    int compare(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;

    int32 queryInterface(const char* interfaceID, void** object) override;
    void setText(const char* text) override { assign(text); }
    void setText8(const char* text) override { assign(text); }
    void setText16(const char16* text) override { assign(text); }
    const char* getText8() override { return text8(); }
    const char16* getText16() override { return text16(); }
    void take(void* text, bool wide) override { FString::take(text, wide); }
    bool isWideString() const override { return FString::isWideString(); }

    FORWARD_FUNKNOWN(CmObject)
};
