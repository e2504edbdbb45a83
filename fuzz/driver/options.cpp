/// Under the address sanitizer a block that can't be had is null, as it is without it.
extern "C" const char* __asan_default_options();
extern "C" const char* __asan_default_options()
{
    return "allocator_may_return_null=1";
}
