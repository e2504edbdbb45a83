#pragma once

#include "foundation/object/fobject.h"
#include "foundation/text/string.h"
#include "foundation/text/ttextobject.h"

/// A text that is counted, and crosses component boundaries as IString and IStringResult.
///
/// One thread at a time, as its String.
class StringObject : public TTextObject<FObject, String>
{
    DECLARE_TYPE(StringObject, FObject)

    using TTextObject::TTextObject;
    using TTextObject::operator=;
};
