#include "uploadmanager/cleartoken.h"

#include "foundation/text/fbase64.h"

#include <algorithm>
#include <string_view>

ClearToken::ClearToken(FString& base64Token) : token(base64Token), isDecoded(FBase64::decode(base64Token)) {}

ClearToken::~ClearToken()
{
    if (isDecoded)
        FBase64::encode(token);
}

bool ClearToken::isUsable() const
{
    std::string_view text(token.text8());
    return isDecoded && std::all_of(text.begin(), text.end(), [](char c) { return c > ' ' && c < '\x7F'; });
}
