#include "application/onetimeprocedure.h"
#include "services/defaults/fdefaultpool.h"

// The user settings come up with the first procedures and are saved by the terminators. A start that does not get
// past the level of the classes' own procedures saves nothing.

namespace
{
constexpr unsigned kLevelOfSettings = 0;
constexpr unsigned kLevelAfterClasses = 99;

bool loadDefaults()
{
    if (!gDefaultPool)
        gDefaultPool = new FDefaultPool;
    gDefaultPool->load();
    return true;
}

bool completeDefaults()
{
    if (gDefaultPool)
        gDefaultPool->postInit();
    return true;
}

bool saveDefaults()
{
    if (!gDefaultPool)
        return true;
    gDefaultPool->save(true);
    gDefaultPool->terminate();
    gDefaultPool->release();
    gDefaultPool = nullptr;
    return true;
}

OneTimeProcedure loading("load defaults", kLevelOfSettings, &loadDefaults);
OneTimeProcedure completing("complete defaults", kLevelAfterClasses, &completeDefaults);
OneTimeProcedure saving("save defaults", kLevelAfterClasses, &saveDefaults, OneTimeProcedure::kTerminator);
} // namespace
