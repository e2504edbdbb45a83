#pragma once

#include "storage/attribute/fattributevalue.h"

#include <cstring>
#include <string>

/// A value with an 8-bit name. Entries are equal, ordered and hashed by their names. One thread at a time.
class FStringIDAttribute : public FAttributeValue
{
    DECLARE_CLASS(FStringIDAttribute, FAttributeValue)

    FStringIDAttribute() = default;
    /// Copies the name; null is the empty one.
    explicit FStringIDAttribute(const char* key) : name(key ? key : "") {}

    const char* getKey() const { return name.c_str(); }
    unsigned getKeyLength() const { return static_cast<unsigned>(name.length()); }
    /// Negative, 0 or positive, as this name sorts before, with or after `key`.
    int compareKey(const char* key) const { return strcmp(name.c_str(), key); }

    bool isEqual(const CmObject* other) const override;
    int compare(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;
    bool externalize(FArchive& archive) const override;
    bool internalize(FArchive& archive) override;

private:
    std::string name;
};
