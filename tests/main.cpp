#include <gtest/gtest.h>

/// Under the address sanitizer a block that can't be had is null, as it is without it.
extern "C" const char* __asan_default_options()
{
    return "allocator_may_return_null=1";
}

int main(int argc, char** argv)
{
    testing::InitGoogleTest(&argc, argv);
    return RUN_ALL_TESTS();
}
