#include "foundation/text/charwidth.h"

#include <malloc.h>

size_t blockSizeOf(const void* block)
{
    return malloc_usable_size(const_cast<void*>(block));
}
