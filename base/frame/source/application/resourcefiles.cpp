#include "application/onetimeprocedure.h"
#include "storage/resource/fresourcearchive.h"

namespace
{
bool knowResourceFiles()
{
    initFResourceArchive();
    return true;
}

OneTimeProcedure resourceFiles("resource files", 0, &knowResourceFiles);
} // namespace
