#include "containers/match/cmtokens.h"

#include "foundation/object/stringhash.h"

#include <string_view>

DEFINE_CLASS(CmTokens, CmObject)

namespace
{
/// The first character from `place` on that is one of `set`, or, if not `isWanted`, none of it; else the end.
const char16* find(const char16* place, std::u16string_view set, bool isWanted)
{
    while (*place && (set.find(*place) != set.npos) != isWanted)
        place++;
    return place;
}
} // namespace

CmTokens::CmTokens(const char16* newText) : text(newText), position(text.text16()) {}

CmTokens::CmTokens(const CmTokens& other)
    : CmObject(other),
      text(other.text),
      position(text.text16() + other.index),
      index(other.index),
      token(other.token),
      lastDelimiter(other.lastDelimiter)
{
}

void CmTokens::reset()
{
    position = text.text16();
    index = 0;
    token.assign(u"");
    lastDelimiter = 0;
}

const char16* CmTokens::next(const char16* delimiters)
{
    const std::u16string_view set(delimiters ? delimiters : u"");
    const char16* const begin = find(position, set, false);
    const char16* const end = find(begin, set, true);
    token.assign(begin, static_cast<int>(end - begin), false);
    lastDelimiter = *end;
    index += static_cast<int>(end - position);
    position = end;
    return token.text16();
}

bool CmTokens::isEqual(const CmObject* other) const
{
    const auto* tokens = FCast(CmTokens, other);
    return tokens ? text == tokens->text : CmObject::isEqual(other);
}

int CmTokens::compare(const CmObject* other) const
{
    const auto* tokens = FCast(CmTokens, other);
    return tokens ? text.compare(tokens->text) : CmObject::compare(other);
}

unsigned CmTokens::hash(unsigned size) const
{
    return hashString16(text.text16(), size);
}
