#include "services/defaults/fplugdefaults.h"

#include "storage/archive/fxmlarchive.h"

DEFINE_CLASS(FPlugDefaults, FDefaultPool)

bool FPlugDefaults::load(const char16* name, const char* rootTag)
{
    return FXmlArchive::restoreObject(name, rootTag, this);
}

bool FPlugDefaults::save(const char16* name, const char* rootTag)
{
    return FXmlArchive::storeObject(name, rootTag, this, false);
}
