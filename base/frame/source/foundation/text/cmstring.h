#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/text/fstring.h"
#include "foundation/text/ttextobject.h"

class CmContainer;

/// A text as an object: for containers, archives and attributes.
///
/// Texts are equal, ordered and hashed by their characters; equal texts of different width have different hashes,
/// so settle on one width in a table. One thread at a time.
class CmString : public TTextObject<CmObject, FString>
{
    DECLARE_CLASS(CmString, CmObject)

    using TTextObject::TTextObject;
    using TTextObject::operator=;
    using FString::compare;

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
};
