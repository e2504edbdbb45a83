#pragma once

#include "foundation/object/fobject.h"
#include "foundation/object/iptr.h"
#include "storage/attribute/fattributelist.h"
#include "storage/attribute/iattributelist.h"

/// Shows one of the keyed lists to components. Holds a reference on the list. One thread at a time.
///
/// In a list of numeric keys a key is a decimal number; any other is refused.
template <class List>
class FAttributeListImp : public FObject, public IAttributeList
{
    DECLARE_TYPE(FAttributeListImp, FObject)

    explicit FAttributeListImp(List* wrapped) : list(wrapped) {}

    int32 setIntAttribute(const char* key, int64 value) override;
    int32 getIntAttribute(const char* key, int64* value) override;
    int32 setFloatAttribute(const char* key, double value) override;
    int32 getFloatAttribute(const char* key, double* value) override;
    int32 setStringAttribute(const char* key, const char16* text) override;
    int32 getStringAttribute(const char* key, const char16** text) override;
    int32 setBinaryAttribute(const char* key, const void* data, uint32 size) override;
    int32 getBinaryAttribute(const char* key, const void** data, uint32* size) override;
    int32 setObjectAttribute(const char* key, FUnknown* object) override;
    int32 getObjectAttribute(const char* key, FUnknown** object) override;
    int32 removeAttribute(const char* key) override;
    int32 addAllTo(IAttributeList* target) override;

    int32 queryInterface(const char* interfaceID, void** object) override;
    FORWARD_FUNKNOWN(FObject)

private:
    FAttributeValue* find(const char* key) const;
    FAttributeValue* make(const char* key);

    IPtr<List> list;
};

extern template class FAttributeListImp<FStringAttributeList>;
extern template class FAttributeListImp<FStringAttributeArray>;
extern template class FAttributeListImp<FIntAttributeList>;
