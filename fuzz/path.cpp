#include "foundation/object/iptr.h"
#include "fuzz/fuzztext.h"
#include "storage/path/fnpath.h"

// Paths from texts and from the platform's bytes, taken apart, joined and compared.

namespace
{
constexpr int kMaxSteps = 20;

/// The full path is always the folder part followed by the name, which holds no delimiter.
void checkParts(const FPath& path)
{
    FString full;
    path.getFullPath(full);
    FString joined(path.getPathName());
    joined.append(path.getName());
    require(full == joined);
    require(path.getName().findNext(0, PATH_DELIMITER) < 0);
}

void changePath(FNPath& path, const FNPath& other, const std::u16string& text)
{
    FString ignored;
    path.getExtension(ignored);
    path.getNameWithoutExtension(ignored, true);
    path.createURL(ignored);
    FNPath relative;
    // Each folder of the one is compared with each of the other: a matter of paths that the platform takes.
    const bool isUsable =
        path.platformPath().size() < FNPath::kMaxPathLength && text.size() < FNPath::kMaxPathLength;
    if (isUsable && relative.assignRelative(&path, &other))
        relative.makeAbsolute(&other);
    path.isInDir(&other);
    require(path.compare(&path) == 0 && path.isEqual(&path) &&
            (path.compare(&other) == 0) == path.isEqual(&other));
    path.descend(text.c_str(), FPath::kFile);
    checkParts(path);
    for (int i = 0; i < kMaxSteps && path.ascend(); i++)
        checkParts(path);
    path.makeValidName(u'_');
    path.updateExtension(true);
}
} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    FuzzText input(data, size);
    const int type = input.takeByte() % 4;
    const std::u16string first = input.takeText(size);
    const std::u16string second = input.takeText(size);
    FNPath path(first.c_str(), type);
    FNPath other(second.c_str(), FPath::kFolder);
    checkParts(path);
    FNPath joined(&other, &path);
    checkParts(joined);
    changePath(path, other, second);

    const std::string bytes(reinterpret_cast<const char*>(data), size);
    FNPath native;
    native.fromPlatformPath(bytes.c_str());
    checkParts(native);
    FNPath again;
    again.fromPlatformPath(native.platformPath().c_str());
    checkParts(again);
    return 0;
}
