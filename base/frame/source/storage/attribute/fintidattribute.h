#pragma once

#include "storage/attribute/fattributevalue.h"

/// A value with a number for a name. Entries are equal, ordered and hashed by it. One thread at a time.
class FIntIDAttribute : public FAttributeValue
{
    DECLARE_CLASS(FIntIDAttribute, FAttributeValue)

    FIntIDAttribute() = default;
    explicit FIntIDAttribute(unsigned int key) : id(key) {}

    unsigned int getKey() const { return id; }
    int compareKey(unsigned int key) const { return id < key ? -1 : id > key; }
    /// Reads a key from decimal digits; false where `text` is anything else or too great.
    static bool parseKey(const char* text, unsigned int& key);

    bool isEqual(const CmObject* other) const override;
    int compare(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;
    bool externalize(FArchive& archive) const override;
    bool internalize(FArchive& archive) override;

private:
    uint32 id = 0;
};
