#include "foundation/text/cmtmpstring.h"

CmTmpString::CmTmpString(const char16* text)
{
    // Never written to: the string is for looking up.
    buffer = const_cast<char16*>(text);
    updateLength();
}

CmTmpString::~CmTmpString()
{
    buffer = nullptr;
}
