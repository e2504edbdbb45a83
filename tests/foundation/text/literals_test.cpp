#include "foundation/text/conststringtable.h"
#include "foundation/text/utranslatedstring.h"
#include "texts.h"

#include <gtest/gtest.h>

namespace
{
// Fetched before main.
const char kLiteral[] = "early";
const char16* const kEarly = ConstStringTable::instance().getString(kLiteral);
const UTranslatedString kGreeting("Hello");

int asked = 0;

const char16* translateLoudly(const char16* key)
{
    ++asked;
    if (ConstString(key) == "Hello")
        return u"HELLO";
    return ConstString(key) == "Null" ? nullptr : u"";
}
} // namespace

TEST(ConstStringTable, GivesOnePointerForOneLiteral)
{
    ConstStringTable& table = ConstStringTable::instance();
    EXPECT_EQ(ConstString(kEarly), "early");
    EXPECT_EQ(table.getString(kLiteral), kEarly);
    const char twin[] = "early";
    EXPECT_NE(table.getString(twin), kEarly) << "found by address, not by text";
    EXPECT_EQ(table.getString(static_cast<const char*>(nullptr)), nullptr);
    EXPECT_EQ(kEmptyString16[0], 0);
}

TEST(ConstStringTable, WidensBySign)
{
    ConstStringTable& table = ConstStringTable::instance();
    EXPECT_EQ(table.getString('a'), u'a');
    EXPECT_EQ(table.getString('\x80'), 0xFF80);
    EXPECT_EQ(table.getString("\xFF")[0], 0xFFFF);
}

TEST(UTranslatedString, KeepsItsFirstAnswer)
{
    const UTranslatedString early("Hello"), late("Hello"), missing("Null"), empty("Empty");
    UTranslatedString::setTranslator(nullptr);
    EXPECT_EQ(early.text(), early.getKey()) << "without a translator the key is the text";

    UTranslatedString::setTranslator(&translateLoudly);
    EXPECT_EQ(ConstString(early.text()), "Hello");
    EXPECT_EQ(ConstString(late.text()), "HELLO");
    EXPECT_EQ(ConstString(late.text()), "HELLO");
    EXPECT_EQ(asked, 1);
    EXPECT_EQ(missing.text(), kEmptyString16);
    EXPECT_EQ(empty.text(), kEmptyString16);
    EXPECT_EQ(missing.text(), kEmptyString16);
    EXPECT_EQ(asked, 3);
    EXPECT_EQ(ConstString(kGreeting.text()), "HELLO");
    UTranslatedString::setTranslator(nullptr);
}
