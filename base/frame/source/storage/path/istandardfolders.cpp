#include "storage/path/istandardfolders.h"

namespace
{
IStandardFolders* theFolders = nullptr;
}

IStandardFolders* IStandardFolders::instance()
{
    return theFolders;
}

void IStandardFolders::setInstance(IStandardFolders* folders)
{
    theFolders = folders;
}
