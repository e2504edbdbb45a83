#include "storage/stream/ffiletype.h"

DEFINE_CLASS(FFileType, CmObject)

namespace
{
bool areSetAndEqual(const FString& left, const FString& right)
{
    return !left.isEmpty() && left == right;
}
} // namespace

FFileType::FFileType(const char* mime, const char* dosExtension, const char* unixExtension, int32 macCode,
                     const char* typeName, const char* typeUti)
    : macType(macCode),
      dosType(dosExtension),
      unixType(unixExtension),
      mimeType(mime),
      uti(typeUti),
      name(typeName)
{
}

bool FFileType::isValid() const
{
    return !dosType.isEmpty() || !unixType.isEmpty() || !mimeType.isEmpty() || !uti.isEmpty() || macType != 0;
}

bool FFileType::operator==(const FFileType& other) const
{
    return areSetAndEqual(uti, other.uti) || areSetAndEqual(dosType, other.dosType) ||
           (macType != 0 && macType == other.macType) || areSetAndEqual(unixType, other.unixType) ||
           areSetAndEqual(mimeType, other.mimeType);
}

void FFileType::reset()
{
    macType = 0;
    for (FString* text : {&dosType, &unixType, &mimeType, &uti, &name})
        text->assign(u"");
}

bool FFileType::hasExtension(const ConstString& extension) const
{
    return !extension.isEmpty() && (dosType.compare(extension, kCaseInsensitive) == 0 ||
                                    unixType.compare(extension, kCaseInsensitive) == 0);
}
