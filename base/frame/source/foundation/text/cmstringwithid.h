#pragma once

#include "foundation/text/cmstring.h"

/// A text with a number of its owner's choice. One thread at a time.
class CmStringWithId : public CmString
{
    DECLARE_CLASS(CmStringWithId, CmString)

    CmStringWithId() = default;
    CmStringWithId(const ConstString& text, int32 number) : CmString(text), id(number) {}

    int32 getId() const { return id; }
    void setId(int32 newId) { id = newId; }

private:
    int32 id = 0;
};
