#pragma once

#include "storage/attribute/fattrlist.h"

#include <vector>

/// A queue of 16-bit texts, each its own or borrowed. One thread at a time.
class FStringList : public FAttrList
{
    DECLARE_CLASS(FStringList, FAttrList)

    FStringList() = default;
    /// The copy owns all its texts.
    FStringList(const FStringList& other);
    FStringList& operator=(const FStringList&) = delete;
    ~FStringList() override;

    /// `text` is 16-bit if `wide`; otherwise it is converted and so always copied. Without `copy` it must outlive
    /// the queue. Null is the empty text.
    void queue(const void* text, bool wide, bool copy);
    /// Takes over a `malloc`ed text.
    void takeText(char16* text);
    /// Copies the texts that are borrowed.
    void makeOwner();
    /// The next text, borrowed; null at the end.
    const char16* unqueue();
    const char16* at(int index) const { return texts[static_cast<unsigned>(index)].text; }

    int total() const override { return static_cast<int>(texts.size()); }
    bool unqueueVariant(FVariant& value) override;
    bool externalize(FArchive& archive) const override;
    bool internalize(FArchive& archive) override;

private:
    struct Text
    {
        const char16* text;
        bool isOwned;
    };

    void removeAll();

    std::vector<Text> texts;
};
