#include "tests/job/job.h"

TEST(Behaviour, IsReadFromItsWords)
{
    struct Row
    {
        const char* words;
        Behaviour::Kind kind;
        std::int64_t number;
        const char* text;
    };
    const Row rows[] = {{"accept", Behaviour::Kind::accept, 0, ""},
                        {"status 503 a b", Behaviour::Kind::status, 503, "a b"},
                        {"stall 0", Behaviour::Kind::stall, 0, ""},
                        {"errors one|two", Behaviour::Kind::errors, 0, "one|two"}};
    for (const Row& row : rows)
    {
        const std::optional<Behaviour> behaviour = Behaviour::parse(row.words);
        ASSERT_TRUE(behaviour) << row.words;
        EXPECT_EQ(behaviour->kind, row.kind) << row.words;
        EXPECT_EQ(behaviour->number, row.number) << row.words;
        EXPECT_EQ(behaviour->text, row.text) << row.words;
    }
    EXPECT_EQ(Behaviour::parse("errors one||two")->texts(), (std::vector<std::string>{"one", "", "two"}));
    for (const char* wrong : {"", "acept", "status", "status x", "stall -1", "stall 1x"})
        EXPECT_FALSE(Behaviour::parse(wrong)) << wrong;
}

TEST(Behaviour, IsPlannedForAPathThatBeginsWithASlash)
{
    const CertificateAuthority authority;
    StandInService service(authority, {});
    EXPECT_TRUE(service.plan("/tracks accept"));
    for (const char* wrong : {"", "tracks accept", "/tracks", "/tracks nothing"})
        EXPECT_FALSE(service.plan(wrong)) << wrong;
}
