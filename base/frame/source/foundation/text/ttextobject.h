#pragma once

#include "foundation/object/istring.h"

/// What the counted texts share: an `Object` that is a `Text`, and crosses component boundaries as IString and
/// IStringResult. It is no class of the object model. One thread at a time.
template <class Object, class Text>
class TTextObject : public Object, public Text, public IStringResult, public IString
{
public:
    using Text::Text;
    using Text::operator=;
    TTextObject() = default;
    TTextObject(const TTextObject&) = default;
    TTextObject& operator=(const TTextObject&) = default;

    int32 queryInterface(const char* interfaceID, void** object) override
    {
        if (isSameInterface(interfaceID, IString::iid))
            return offerInterface<IString>(this, object);
        if (isSameInterface(interfaceID, IStringResult::iid))
            return offerInterface<IStringResult>(this, object);
        return Object::queryInterface(interfaceID, object);
    }
    void setText(const char* text) override { this->assign(text); }
    void setText8(const char* text) override { this->assign(text); }
    void setText16(const char16* text) override { this->assign(text); }
    const char* getText8() override { return this->text8(); }
    const char16* getText16() override { return this->text16(); }
    using Text::take;
    void take(void* text, bool wide) override { Text::take(text, wide); }
    bool isWideString() const override { return Text::isWideString(); }

    FORWARD_FUNKNOWN(Object)
};
