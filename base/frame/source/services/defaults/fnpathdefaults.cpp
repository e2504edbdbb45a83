#include "containers/sequence/cmcontainer.h"
#include "services/defaults/fdefaultpool.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/filesystem/fsys.h"
#include "storage/path/fnpath.h"

// Paths that are kept in the user's settings.

namespace
{
constexpr const char* kDefaultPaths = "Default Paths";
constexpr const char* kGlobalDefault = "Global Default";

FFileType* firstType(const CmContainer* types)
{
    return types ? FCast(FFileType, types->at(0)) : nullptr;
}

std::string keyOf(const FFileType& fileType)
{
    FString key;
    FSys::getDefaultKey(fileType.getName(), key);
    key.toMultiByte(kEncodingUtf8);
    return key.text8();
}

bool loadFolder(FNPath& folder, const char* key)
{
    return folder.fromDefault(key) && gFileSystem && gFileSystem->dirExists(&folder);
}
} // namespace

bool FNPath::storeAsDefault(const char* key) const
{
    FString text;
    return gDefaultPool && key && getFullPath(text) && gDefaultPool->setTString(kDefaultPaths, key, text);
}

bool FNPath::fromDefault(const char* key)
{
    FString text;
    if (!gDefaultPool || !key || !gDefaultPool->getTString(kDefaultPaths, key, text))
        return false;
    takeParts(FNPath(text.text16(), kFile));
    platformState = -1;
    return true;
}

bool FNFileSystem::storeLastPath()
{
    return lastPath && lastPath->storeAsDefault(kGlobalDefault);
}

bool FNFileSystem::loadLastPath()
{
    FNPath stored(FPath::kFolder);
    if (!stored.fromDefault(kGlobalDefault))
        return false;
    stored.setPathType(FPath::kFolder);
    setLastPath(&stored);
    return true;
}

void FSys::getDefaultKey(const FString& typeName, FString& key)
{
    key.assign(u"Default Path for \"");
    key.append(typeName);
    key.append(u"\" Files");
}

bool FSys::getInitPath(FNPath*& folder, FString& name, CmContainer* types, int16 forSaving)
{
    const FFileType* fileType = firstType(types);
    FNPath place(FPath::kFolder);
    const bool isFound =
        (fileType && loadFolder(place, keyOf(*fileType).c_str())) || loadFolder(place, kGlobalDefault);
    FFileSystem::replaceInvalid(name, 0, true);
    if (forSaving && fileType && !name.isEmpty())
    {
        FPath proposed(name.text16(), static_cast<const FPath*>(nullptr), FPath::kFile);
        proposed.setFileType(*fileType);
        name = proposed.getName();
    }
    place.setPathType(FPath::kFolder);
    folder = isFound ? new FNPath(place) : nullptr;
    return isFound;
}

void FSys::storeInitPath(const FNPath& folder, CmContainer* types)
{
    folder.storeAsDefault(kGlobalDefault);
    if (const FFileType* fileType = firstType(types))
        folder.storeAsDefault(keyOf(*fileType).c_str());
}
