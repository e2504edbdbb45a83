#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/text/fstring.h"

/// An attribute as the older parser and writer hand it around: two texts, in 8 bits unless the parser was told to
/// widen values. One thread at a time.
class FXmlAttribute : public CmObject
{
    DECLARE_CLASS(FXmlAttribute, CmObject)

    FXmlAttribute() = default;
    FXmlAttribute(const ConstString& name, const ConstString& value);

    FString name;
    FString value;
};
