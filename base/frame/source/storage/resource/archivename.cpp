#include "storage/resource/archivename.h"

#include "foundation/text/encodings.h"
#include "foundation/text/string.h"
#include "storage/path/fpath.h"

bool ArchiveName::isSafe(const ConstString& name)
{
    if (name.isEmpty() || name == ConstString(".") || name == ConstString(".."))
        return false;
    return name.findNext(-1, kUnixDelimiter) < 0 && name.findNext(-1, kWindowsDelimiter) < 0;
}

bool ArchiveName::isStorable(const ConstString& name)
{
    if (name.length() >= static_cast<unsigned>(kMaxName))
        return false;
    if (name.isAsciiString())
        return true;
    String bytes(name);
    bytes.toMultiByte(kEncodingUtf8);
    String again;
    again.fromUTF8(bytes.text8());
    return again == name;
}
