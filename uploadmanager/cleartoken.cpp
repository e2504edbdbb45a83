#include "uploadmanager/cleartoken.h"

#include "foundation/text/fbase64.h"

#include <algorithm>
#include <string_view>

namespace
{
FLock tokenLock("token");
}

ClearToken::ClearToken(FString& base64Token)
    : guard(tokenLock),
      token(base64Token),
      isDecoded(FBase64::decode(base64Token))
{
}

ClearToken::~ClearToken()
{
    // What can't be encoded is no token; it must not stay in clear either.
    if (isDecoded && !FBase64::encode(token))
        token = FString();
}

void ClearToken::replace(FString& base64Token, const FString& value)
{
    FLockScope scope(tokenLock);
    base64Token = value;
}

bool ClearToken::isUsable() const
{
    std::string_view text(token.text8());
    return isDecoded && !text.empty() &&
           std::all_of(text.begin(), text.end(), [](char c) { return c > ' ' && c < '\x7F'; });
}
