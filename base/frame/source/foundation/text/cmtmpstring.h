#pragma once

#include "foundation/text/cmstring.h"

/// A borrowed wide text in the shape of an object, for looking it up in a container. Copies nothing.
///
/// Lives on the stack, shorter than its text. A copy of it as an object is a CmString of its own. It must not be
/// changed: its characters belong to another. One thread at a time.
class CmTmpString : public CmString
{
    DECLARE_TYPE(CmTmpString, CmString)

    explicit CmTmpString(const char16* text);
    CmTmpString(const CmTmpString&) = delete;
    CmTmpString& operator=(const CmTmpString&) = delete;
    ~CmTmpString() override;
};
