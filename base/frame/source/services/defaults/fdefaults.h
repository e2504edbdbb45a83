#pragma once

#include "foundation/text/fstring.h"
#include "storage/attribute/fattributes.h"

/// One group of user settings: values by key, with a version of their meaning.
///
/// Reads give false, null or 0 where the key is missing or its value is of another kind, and leave their target
/// untouched. An `init...` stores only where the key is absent, so that the program's defaults never overwrite the
/// user's. Groups are equal, ordered and hashed by their names. Main thread.
class FDefaults : public CmObject
{
    DECLARE_CLASS(FDefaults, CmObject)

    FDefaults() = default;
    FDefaults(const char* groupName, int groupVersion);
    /// The copy has its own values.
    FDefaults(const FDefaults& other);
    FDefaults& operator=(const FDefaults&) = delete;

    const char* getGroup() const { return group.text8(); }
    int getVersion() const { return version; }

    bool getLong(const char* key, int32& value) const;
    int32 getLong(const char* key) const;
    void setLong(const char* key, int32 value);
    void initLong(const char* key, int32 value);
    bool getLongLong(const char* key, int64& value) const;
    int64 getLongLong(const char* key) const;
    void setLongLong(const char* key, int64 value);
    void initLongLong(const char* key, int64 value);
    bool getDouble(const char* key, double& value) const;
    double getDouble(const char* key) const;
    void setDouble(const char* key, double value);
    void initDouble(const char* key, double value);
    bool getString(const char* key, String& text) const;
    void setString(const char* key, const ConstString& text);
    void initString(const char* key, const ConstString& text);
    /// Borrowed, until the value is changed or read at another width.
    const char* getString8(const char* key) const;
    void setString8(const char* key, const char* text);
    void initString8(const char* key, const char* text);
    const char16* getString16(const char* key) const;
    void setString16(const char* key, const char16* text);
    void initString16(const char* key, const char16* text);
    /// Borrowed, if it is a `className` (any, where that is null).
    CmObject* getObj(const char* key, const char* className) const;
    /// Adds a reference. The object is stored as it is when the settings are saved. Null removes the entry.
    void setObj(const char* key, CmObject* object);

    bool containsEntry(const char* key) const;
    bool removeEntry(const char* key);
    bool isEmpty() const;
    void removeAll();

    /// Null until there is an entry. Borrowed.
    FAttributes* getValues() const { return values; }
    FAttributes& makeValues();

    bool isEqual(const CmObject* other) const override;
    int compare(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;

private:
    FString group{""};
    IPtr<FAttributes> values;
    int32 version = 0;
};
