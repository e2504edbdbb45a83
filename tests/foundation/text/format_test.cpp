#include "texts.h"

#include <cstdio>
#include <gtest/gtest.h>

namespace
{
/// Both widths must print the same characters for the same format.
template <class... Values>
void expectAlike(const char* format, Values... values)
{
    char expected[8192];
    ASSERT_GE(std::snprintf(expected, sizeof(expected), format, values...), 0);
    String narrow, wideText;
    EXPECT_EQ(shape(narrow.printf(format, values...)), std::string("narrow:") + expected);
    EXPECT_EQ(shape(wideText.printf(wide(format).text16(), values...)), std::string("wide:") + expected)
        << format;
}
} // namespace

TEST(Format, PrintsNumbersAlikeInBothWidths)
{
    expectAlike("plain %d%%", 100);
    expectAlike("%d %5d|%-5d|%05d|%+d|% d", -1, 22, 33, 44, 55, 66);
    expectAlike("%i %u %x %X %#x %o", -3, 4000000000u, 255, 255, 255, 8);
    expectAlike("%hd %ld %lld %zu %jd %td", static_cast<short>(7), -8L, -9LL, sizeof(int), intmax_t{5},
                ptrdiff_t{6});
    expectAlike("%f %.2f %10.3f %-10.1f| %e %g %G %a", 1.5, 2.345, 3.14159, 2.0, 12345.678, 1e-9, 1e20, 0.5);
    expectAlike("%.50g %lf %Lf", 0.1, 0.25, 1.5L);
    expectAlike("%*d|%-*d|%.*f", 6, 42, 6, 42, 3, 2.0);
    expectAlike("%*d|%.*f", -6, 42, -1, 2.0);
    expectAlike("%c|%3c|%-3c|", 'a', 'b', 'c');
    expectAlike("%3000d", 7);
}

TEST(Format, TakesSixteenBitTextInASixteenBitFormat)
{
    String text;
    EXPECT_EQ(shape(text.printf(u"%s=%d", u"größe", 3)), "wide:größe=3");
    EXPECT_EQ(shape(text.printf(u"[%6s|%-6s|%.2s]", u"abc", u"abc", u"abc")), "wide:[   abc|abc   |ab]");
    EXPECT_EQ(shape(text.printf(u"%s", static_cast<const char16*>(nullptr))), "wide:(null)");
    EXPECT_EQ(shape(text.printf(u"%hs %c", "narrow", u'ä')), "wide:narrow ä");
    EXPECT_EQ(shape(text.printf(u"%k%", 1)), "wide:%k%") << "what is no conversion stands as it is";
    text.assign(u"self");
    EXPECT_EQ(shape(text.printf(u"%s %s", text.text16(), text.text16())), "wide:self self");
    text.assign("self");
    EXPECT_EQ(shape(text.printf("%s %s", text.text8(), text.text8())), "narrow:self self");
}

TEST(Format, KeepsALimitedLength)
{
    String longText, text;
    longText.assign('x', 10000);
    EXPECT_EQ(text.printf("%s", longText.text8()).length(), 4095u) << "the terminator is one of the 4096";
    EXPECT_EQ(text.printf(u"%s", longText.text16()).length(), 4096u);
    EXPECT_EQ(text.printf(u"%2000000000d%.2000000000d", 1, 2).length(), 4096u);
}
