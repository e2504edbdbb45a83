#include "application/onetimeprocedure.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace
{
std::vector<std::string> gRan;

template <char Name, bool Result = true>
bool run()
{
    gRan.push_back(std::string(1, Name));
    return Result;
}

std::string take()
{
    std::string result;
    for (const std::string& name : gRan)
        result += name;
    gRan.clear();
    return result;
}

class OneTimeProcedures : public testing::Test
{
protected:
    // The program's own ones are none of this test.
    OneTimeProcedures() { OneTimeProcedure::cancel(); }
    ~OneTimeProcedures() override { OneTimeProcedure::cancel(); }
};
} // namespace

TEST_F(OneTimeProcedures, RunOnceInTheOrderOfTheirLevels)
{
    OneTimeProcedure c("c", 20, &run<'c'>), a("a", 0, &run<'a'>), b("b", 10, &run<'b'>),
        d("d", 10, &run<'d'>);
    EXPECT_TRUE(OneTimeProcedure::initialize(0));
    EXPECT_EQ(take(), "a");
    EXPECT_TRUE(OneTimeProcedure::initialize(15));
    EXPECT_EQ(take(), "bd");
    EXPECT_TRUE(OneTimeProcedure::initialize(15));
    EXPECT_TRUE(OneTimeProcedure::initialize(20));
    EXPECT_TRUE(OneTimeProcedure::initialize(99));
    EXPECT_EQ(take(), "c");
    EXPECT_STREQ(c.getName(), "c");
}

TEST_F(OneTimeProcedures, TheFirstFailureEndsThemAll)
{
    OneTimeProcedure a("a", 1, &run<'a'>), b("b", 2, &run<'b', false>), c("c", 3, &run<'c'>);
    EXPECT_FALSE(OneTimeProcedure::initialize(99));
    EXPECT_EQ(take(), "ab");
    EXPECT_TRUE(OneTimeProcedure::initialize(99)) << "nothing is left";
    EXPECT_EQ(take(), "");
}

TEST_F(OneTimeProcedures, TerminatorsRunAllOnce)
{
    OneTimeProcedure b("b", 200, &run<'b'>, OneTimeProcedure::kTerminator);
    OneTimeProcedure a("a", 100, &run<'a', false>, OneTimeProcedure::kTerminator);
    OneTimeProcedure::initialize(0);
    OneTimeProcedure::terminate();
    EXPECT_EQ(take(), "ab") << "a result of false stops no terminator";
    OneTimeProcedure::terminate();
    EXPECT_EQ(take(), "");
}

TEST_F(OneTimeProcedures, CancelForgetsThem)
{
    OneTimeProcedure a("a", 0, &run<'a'>), b("b", 0, &run<'b'>, OneTimeProcedure::kTerminator);
    OneTimeProcedure::cancel();
    OneTimeProcedure::initialize(99);
    OneTimeProcedure::terminate();
    EXPECT_EQ(take(), "");
}

TEST_F(OneTimeProcedures, AnObjectThatGoesTakesItselfOut)
{
    {
        OneTimeProcedure gone("gone", 0, &run<'x'>);
    }
    OneTimeProcedure a("a", 0, &run<'a'>);
    OneTimeProcedure::initialize(0);
    EXPECT_EQ(take(), "a");
}
