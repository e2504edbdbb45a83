#include "services/defaults/fdefaultsbypass.h"

FDefaultsBypass& FDefaultsBypass::instance()
{
    static FDefaultsBypass bypass;
    return bypass;
}
