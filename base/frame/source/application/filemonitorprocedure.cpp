#include "application/onetimeprocedure.h"
#include "storage/filesystem/fnmonitor.h"

// Whoever wants to hear of changes on the disk makes and starts the monitor; its thread ends with the program.

namespace
{
constexpr unsigned kLevelAfterClasses = 99;

bool endFileMonitor()
{
    termFNMonitor();
    return true;
}

OneTimeProcedure ending("end file monitor", kLevelAfterClasses, &endFileMonitor,
                        OneTimeProcedure::kTerminator);
} // namespace
