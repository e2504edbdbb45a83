#include "fuzz/driver/options.h"

#ifdef FUZZ_SANITIZED
#include <sanitizer/lsan_interface.h>
#endif

/// Under the address sanitizer a block that can't be had is null, as it is without it.
extern "C" const char* __asan_default_options();
extern "C" const char* __asan_default_options()
{
    return "allocator_may_return_null=1";
}

LeaksAllowed::LeaksAllowed()
{
#ifdef FUZZ_SANITIZED
    __lsan_disable();
#endif
}

LeaksAllowed::~LeaksAllowed()
{
#ifdef FUZZ_SANITIZED
    __lsan_enable();
#endif
}
