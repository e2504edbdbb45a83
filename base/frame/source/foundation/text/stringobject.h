#pragma once

#include "foundation/object/fobject.h"
#include "foundation/object/istring.h"
#include "foundation/text/string.h"

/// A text that is counted, and crosses component boundaries as IString and IStringResult.
///
/// One thread at a time, as its String.
class StringObject : public FObject, public String, public IStringResult, public IString
{
    DECLARE_TYPE(StringObject, FObject)

    using String::String;
    using String::operator=;
    StringObject() = default;
    StringObject(const StringObject&) = default;
    StringObject& operator=(const StringObject&) = default;

    using String::take;
    int32 queryInterface(const char* interfaceID, void** object) override;
    void setText(const char* text) override { assign(text); }
    void setText8(const char* text) override { assign(text); }
    void setText16(const char16* text) override { assign(text); }
    const char* getText8() override { return text8(); }
    const char16* getText16() override { return text16(); }
    void take(void* text, bool wide) override { String::take(text, wide); }
    bool isWideString() const override { return String::isWideString(); }

    FORWARD_FUNKNOWN(FObject)
};
