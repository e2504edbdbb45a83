#pragma once

#include "foundation/object/fvariant.h"
#include "foundation/object/iattributes.h"
#include "foundation/object/ipersistent.h"
#include "foundation/object/iptr.h"
#include "foundation/text/fstring.h"
#include "services/components/fcomponentregistry.h"

inline const FUID kWordComponentID{0x2C9A41E7, 0x5D034B8F, 0x91E6703A, 0xB8D25F14};

/// A component's object, which stores a word.
class WordComponent : public FObject, public IPersistent
{
public:
    int32 queryInterface(const char* interfaceID, void** object) override
    {
        if (isSameInterface(interfaceID, IPersistent::iid))
            return offerInterface<IPersistent>(this, object);
        return FObject::queryInterface(interfaceID, object);
    }
    FORWARD_FUNKNOWN(FObject)
    int32 getClassID(char* uid) override
    {
        kWordComponentID.toTUID(uid);
        return kResultOk;
    }
    int32 saveAttributes(IAttributes* attributes) override
    {
        return attributes->set("word", FVariant(word.text8())) ? kResultOk : kNoInterface;
    }
    int32 loadAttributes(IAttributes* attributes) override
    {
        FVariant value;
        attributes->get("word", value);
        word.assign(value.getString8());
        return kResultOk;
    }
    static FUnknown* make() { return static_cast<FObject*>(new WordComponent); }

    FString word;
};

/// Knows the component while it lives.
struct WordComponents
{
    WordComponents() : registry(adopt(new FComponentRegistry))
    {
        gComponentRegistry = registry;
        registry->registerComponent(
            new FComponentDescription("Word", kWordComponentID, "Word", &WordComponent::make));
    }
    ~WordComponents() { gComponentRegistry = nullptr; }
    WordComponents(const WordComponents&) = delete;
    WordComponents& operator=(const WordComponents&) = delete;

    IPtr<FComponentRegistry> registry;
};
