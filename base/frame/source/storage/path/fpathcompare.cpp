#include "storage/path/fpathcompare.h"

#include "storage/path/fpath.h"

namespace
{
char16 characterAt(const ConstString& text, unsigned index)
{
    return text.isWideString() ? text.getChar16(index) : static_cast<unsigned char>(text.getChar8(index));
}

int compareCharacters(char16 left, char16 right, bool caseSensitive)
{
    if (!caseSensitive)
    {
        left = ConstString::toUpper(left);
        right = ConstString::toUpper(right);
    }
    if (left == right)
        return 0;
    if (left == PATH_DELIMITER)
        return -1;
    if (right == PATH_DELIMITER)
        return 1;
    return left < right ? -1 : 1;
}
} // namespace

int FPathCompare::compareTreeStyle(const ConstString& left, const ConstString& right, int maxLength,
                                   bool caseSensitive)
{
    const unsigned shorter = left.length() < right.length() ? left.length() : right.length();
    const bool isLimited = maxLength >= 0 && static_cast<unsigned>(maxLength) <= shorter;
    const unsigned end = isLimited ? static_cast<unsigned>(maxLength) : shorter;
    for (unsigned i = 0; i < end; i++)
        if (int difference = compareCharacters(characterAt(left, i), characterAt(right, i), caseSensitive))
            return difference;
    if (isLimited || left.length() == right.length())
        return 0;
    return left.length() < right.length() ? -1 : 1;
}

int FPathCompare::compareTreeStyle(const FPath* left, const FPath* right, bool withNames)
{
    if (!left || !right)
        return left ? 1 : right ? -1 : 0;
    FString leftText(left->getPathName());
    FString rightText(right->getPathName());
    if (withNames)
    {
        left->getFullPath(leftText);
        right->getFullPath(rightText);
    }
    return compareTreeStyle(leftText, rightText, -1, left->isCaseSensitive());
}
