#include "services/components/fcomponentdescription.h"

#include <cstring>

bool FComponentDescription::isOfCategory(const char* wanted) const
{
    return wanted && category && strcmp(category, wanted) == 0;
}
