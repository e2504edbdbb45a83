#include "containers/sequence/cmcontainer.h"
#include "foundation/object/iptr.h"
#include "foundation/text/cmstring.h"

namespace
{
void addPiece(const IPtr<CmString>& piece, CmContainer& result)
{
    // The container takes over a reference of its own.
    piece->addRef();
    if (!result.add(piece))
        piece->release();
}

/// The delimiter in the width of the text where that is possible, so that no search has to convert the text.
String fitDelimiter(const ConstString& delimiter, const ConstString& text)
{
    String result(delimiter);
    if (text.isWideString())
        result.toWideString();
    else if (result.isAsciiString())
        result.toMultiByte();
    return result;
}
} // namespace

int CmString::split(const ConstString& text, CmContainer& result, const ConstString& delimiter, bool trim,
                    bool dropEmptyLast)
{
    result.takeElements();
    const String sought = fitDelimiter(delimiter, text);
    int start = 0;
    bool isLast = false;
    while (!isLast)
    {
        const int found = text.findNext(start, sought);
        isLast = found < 0;
        const auto piece = adopt(new CmString);
        piece->assign(ConstString(text, start), isLast ? -1 : found - start);
        if (trim)
            piece->trim(kGroupSpace);
        if (!piece->isEmpty() || (isLast && !dropEmptyLast))
            addPiece(piece, result);
        start = found + static_cast<int>(sought.length());
    }
    return result.total();
}

int CmString::split8(const char* text, CmContainer& result, const char* delimiter, bool trim,
                     bool dropEmptyLast)
{
    return split(text, result, delimiter, trim, dropEmptyLast);
}

int CmString::split16(const char16* text, CmContainer& result, const char16* delimiter, bool trim,
                      bool dropEmptyLast)
{
    return split(text, result, delimiter, trim, dropEmptyLast);
}
