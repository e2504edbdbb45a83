#include "foundation/object/fuid.h"

#include <sys/random.h>

bool FUID::generate()
{
    // So few bytes come whole or not at all.
    if (getrandom(data, sizeof data, 0) != static_cast<ssize_t>(sizeof data))
        return false;
    data[6] = static_cast<char>((data[6] & 0x0F) | 0x40);
    data[8] = static_cast<char>((data[8] & 0x3F) | 0x80);
    return true;
}
