#include "fuzz/driver/options.h"

#include "foundation/object/classfactory.h"

#include <string_view>

#ifdef FUZZ_SANITIZED
#include <sanitizer/lsan_interface.h>
#endif

/// Under the address sanitizer a block that can't be had is null, as it is without it. Fewer freed blocks are kept from use
/// than usual, which inputs of 1 MiB would fill with gigabytes.
extern "C" const char* __asan_default_options();
extern "C" const char* __asan_default_options()
{
    return "allocator_may_return_null=1:quarantine_size_mb=16";
}

namespace
{
bool namesContainer(std::string_view input)
{
    TArray<const MetaClass*> classes;
    ClassFactory::instance(true)->listClasses(classes);
    for (int i = 0; i < classes.total(); i++)
        for (const char* name : {classes[i]->className, classes[i]->persistentName})
            if (name && classes[i]->isTypeOf("CmContainer") && input.find(name) != input.npos)
                return true;
    return false;
}
} // namespace

LeaksAllowed::LeaksAllowed(const uint8_t* data, size_t size)
    : isAllowed(namesContainer({reinterpret_cast<const char*>(data), size}))
{
#ifdef FUZZ_SANITIZED
    if (isAllowed)
        __lsan_disable();
#endif
}

LeaksAllowed::~LeaksAllowed()
{
#ifdef FUZZ_SANITIZED
    if (isAllowed)
        __lsan_enable();
#endif
}
