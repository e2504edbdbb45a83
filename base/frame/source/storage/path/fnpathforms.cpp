#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/optionaltext.h"
#include "storage/path/fnpath.h"
#include "storage/stream/fstream.h"

// The file forms of native paths.

namespace
{
/// How delimiters are written: "PathType" in attributes, the version of the layout in archives.
enum Layout : int32
{
    kWindowsLayout = 1,
    kUnixLayout = 2
};

// A folder part as it was stored becomes one of this platform, fit to have `name` behind it.
void makeNative(FString& path, int32 layout, const FString& name)
{
    path.toWideString();
    const char16 stored = layout == kUnixLayout ? kUnixDelimiter : kWindowsDelimiter;
    const char16 set[] = {stored, 0};
    if (stored != PATH_DELIMITER)
        path.replaceChars16(set, PATH_DELIMITER);
    if (!name.isEmpty() && !path.isEmpty() && !path.testChar16(path.length() - 1, PATH_DELIMITER))
        path.append(PATH_DELIMITER);
}
} // namespace

bool FNPath::storeAttributes(FAttributes& attributes) const
{
    OptionalText::store(attributes, "Name", name);
    OptionalText::store(attributes, "Path", path);
    if (type != kFile)
        attributes.set("Type", type);
    if (storeAttrFileType && !isFolder() && fileType.isValid())
        attributes.setMember("FileType", fileType);
    attributes.set("PathType", kUnixLayout + 0);
    return true;
}

bool FNPath::restoreAttributes(FAttributes& attributes)
{
    OptionalText::restore(attributes, "Name", name);
    OptionalText::restore(attributes, "Path", path);
    if (!attributes.get("Type", type))
        type = kFile;
    fileType.reset();
    if (!isFolder())
        attributes.getMember("FileType", fileType);
    int32 layout = kWindowsLayout;
    attributes.get("PathType", layout);
    makeNative(path, layout, name);
    platformState = -1;
    return true;
}

bool FNPath::externalize(FArchive& archive) const
{
    FStream& stream = archive.getStream();
    return name.externalize(archive) && fileType.externalize(archive) && stream.writeInt32(kUnixLayout) &&
           stream.writeInt16(type) && path.externalize(archive);
}

bool FNPath::internalize(FArchive& archive)
{
    FStream& stream = archive.getStream();
    int32 layout = 0;
    if (!name.internalize(archive) || !fileType.internalize(archive) || !stream.readInt32(layout))
        return false;
    if (layout < kWindowsLayout || layout > kUnixLayout)
        return false;
    if (!stream.readInt16(type) || !path.internalize(archive))
        return false;
    makeNative(path, layout, name);
    platformState = -1;
    return true;
}
