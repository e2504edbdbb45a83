#include "foundation/object/cmuid.h"
#include "foundation/object/iattributes.h"
#include "foundation/object/icloneable.h"
#include "foundation/object/ipersistent.h"
#include "foundation/object/istring.h"
#include "foundation/object/iupdatehandler.h"
#include "foundation/text/string.h"

#include <gtest/gtest.h>

#include <cstring>
#include <set>
#include <string>

namespace
{
const FUID kSample(0x00112233, 0x44556677, 0x8899AABB, 0xCCDDEEFF);

std::string digitsOf(const FUID& uid)
{
    char text[33];
    uid.toString(text);
    return text;
}

std::string longStringOf(const CmUID& uid)
{
    char text[33];
    uid.toLongString(text);
    return text;
}
} // namespace

TEST(FUID, StoresWordsMostSignificantByteFirst)
{
    char bytes[16];
    kSample.toTUID(bytes);
    EXPECT_EQ(memcmp(bytes, "\x00\x11\x22\x33\x44\x55\x66\x77\x88\x99\xAA\xBB\xCC\xDD\xEE\xFF", 16), 0);
    EXPECT_EQ(kSample.getLong1(), 0x00112233u);
    EXPECT_EQ(kSample.getLong4(), 0xCCDDEEFFu);
    FUID copied;
    copied = bytes;
    EXPECT_EQ(copied, kSample);
    uint32 words[4];
    copied.to4Int(words[0], words[1], words[2], words[3]);
    FUID rebuilt;
    rebuilt.from4Int(words[0], words[1], words[2], words[3]);
    EXPECT_EQ(rebuilt, kSample);
}

TEST(FUID, IsValidWithAnyByteSet)
{
    EXPECT_FALSE(FUID().isValid());
    EXPECT_FALSE(FUID(static_cast<const char*>(nullptr)).isValid());
    EXPECT_TRUE(FUID(0, 0, 0, 1).isValid());
}

TEST(FUID, ReadsAndWritesDigits)
{
    EXPECT_EQ(digitsOf(kSample), "00112233445566778899AABBCCDDEEFF");
    kSample.toString(nullptr);
    FUID uid;
    EXPECT_TRUE(uid.fromString("00112233445566778899aabbccddeeff"));
    EXPECT_EQ(uid, kSample);
    for (const char* text : {static_cast<const char*>(nullptr), "", "00112233445566778899AABBCCDDEEF",
                             "00112233445566778899AABBCCDDEEFF0"})
        EXPECT_FALSE(uid.fromString(text)) << (text ? text : "null");
    EXPECT_EQ(uid, kSample) << "a refused text must not change the value";
}

TEST(FUID, RegistryFormIgnoresBracesAndHyphens)
{
    char text[39];
    kSample.toRegistryString(text);
    EXPECT_STREQ(text, "{00112233-4455-6677-8899-AABBCCDDEEFF}");
    FUID uid;
    EXPECT_TRUE(uid.fromRegistryString("x00112233y4455z6677.8899 AABBCCDDEEFF!"));
    EXPECT_EQ(uid, kSample);
    EXPECT_FALSE(uid.fromRegistryString("{00112233-4455-6677-8899-AABBCCDDEEFF"));
}

TEST(FUID, PrintsByStyle)
{
    const char* words = " (0x00112233, 0x44556677, 0x8899AABB, 0xCCDDEEFF)";
    const char* heads[] = {"INLINE_UID", "DECLARE_UID", "FUID"};
    char text[100];
    for (int style = 0; style < 3; style++)
    {
        kSample.print(text, style);
        EXPECT_EQ(text, std::string(heads[style]) + words);
    }
    for (int style : {3, 99, -1})
    {
        kSample.print(text, style);
        EXPECT_STREQ(text, "DECLARE_CLASS_IID (Interface, 0x00112233, 0x44556677, 0x8899AABB, 0xCCDDEEFF)");
    }
    testing::internal::CaptureStdout();
    kSample.print(nullptr, 2);
    EXPECT_EQ(testing::internal::GetCapturedStdout(), std::string("FUID") + words + "\n");
}

TEST(FUID, GeneratesDistinctRandomIdentifiersOfVersion4)
{
    std::set<std::string> seen;
    for (int i = 0; i < 200; i++)
    {
        FUID uid;
        ASSERT_TRUE(uid.generate());
        const std::string digits = digitsOf(uid);
        EXPECT_EQ(digits[12], '4');
        EXPECT_NE(std::string("89AB").find(digits[16]), std::string::npos);
        seen.insert(digits);
    }
    EXPECT_EQ(seen.size(), 200u);
}

TEST(FUID, InterfacesHaveTheirPublishedIdentifiers)
{
    EXPECT_EQ(digitsOf(FUnknown::iid), "0000000000000000C000000000000046");
    EXPECT_EQ(digitsOf(IString::iid), "F99DB7A30FC14821800B0CF98E348EDF");
    EXPECT_EQ(digitsOf(IStringResult::iid), "550798BC872049DB84920A153B50B7A8");
    EXPECT_EQ(digitsOf(IDependent::iid), "F52B7AAEDE72416D8AF18ACE9DD7BD5E");
    EXPECT_EQ(digitsOf(IUpdateHandler::iid), "F5246D5686544D60B026AFB57B697B37");
    EXPECT_EQ(digitsOf(IPersistent::iid), "BA1A46373C9F46D0A65DBA0EB85DA829");
    EXPECT_EQ(digitsOf(IAttributes::iid), "FA1E32F9CA6D46F5A982F956B1191B58");
    EXPECT_EQ(digitsOf(ICloneable::iid), "D45406B93A2D44439DAD9BA985A1454B");
}

TEST(CmUID, LongStringTakesWhatDigitsThereAre)
{
    CmUID uid(kSample);
    EXPECT_EQ(longStringOf(uid), "00112233445566778899AABBCCDDEEFF");
    EXPECT_TRUE(uid.fromLongString(""));
    EXPECT_EQ(uid, CmUID(kSample));
    EXPECT_TRUE(uid.fromLongString("aF1"));
    EXPECT_EQ(longStringOf(uid), "AF102233445566778899AABBCCDDEEFF");
    EXPECT_TRUE(uid.fromLongString("zz"));
    EXPECT_EQ(longStringOf(uid), "00102233445566778899AABBCCDDEEFF");
    EXPECT_TRUE(uid.fromLongString("11111111111111111111111111111111ignored"));
    EXPECT_EQ(longStringOf(uid), std::string(32, '1'));
}

TEST(CmUID, ShortStringCutsBitsFromTheLeastSignificantOn)
{
    char text[27];
    EXPECT_EQ(CmUID(FUID(0x01000000, 0, 0, 0)).toShortString(text), 26);
    EXPECT_STREQ(text, "10000000000000000000000000");
    // Bits 5 to 7 of the first byte and the lowest two of the second make the second group.
    CmUID(FUID(0xE0030000, 0, 0, 0)).toShortString(text);
    EXPECT_STREQ(text, "0V000000000000000000000000");
    CmUID(FUID(0xFFFFFFFF, 0xFFFFFFFF, 0xFFFFFFFF, 0xFFFFFFFF)).toShortString(text);
    EXPECT_STREQ(text, "VVVVVVVVVVVVVVVVVVVVVVVVV7");

    CmUID lacking(kSample);
    EXPECT_TRUE(lacking.fromShortString("V7"));
    EXPECT_EQ(lacking, CmUID(FUID(0xFF000000, 0, 0, 0)));

    for (int i = 0; i < 50; i++)
    {
        CmUID original, restored;
        original.generate();
        original.toShortString(text);
        EXPECT_TRUE(restored.fromShortString(text));
        EXPECT_EQ(original, restored) << text;
    }
}

TEST(CmUID, IsComparedByItsBytes)
{
    const CmUID one(kSample), same(kSample), greater(FUID(0xF0000000, 0, 0, 0)), copied(one);
    const CmObject other;
    EXPECT_TRUE(one.isEqual(&same));
    EXPECT_TRUE(one.isEqual(&copied));
    EXPECT_FALSE(one.isEqual(&greater));
    EXPECT_FALSE(one.isEqual(&other));
    EXPECT_FALSE(one.isEqual(nullptr));
    EXPECT_EQ(one.hash(97), same.hash(97));
    EXPECT_EQ(one.compare(&same), 0);
    EXPECT_LT(one.compare(&greater), 0);
    EXPECT_GT(greater.compare(&one), 0);
}

TEST(CmUID, WritesItsDigitsToAText)
{
    String text;
    CmUID(kSample).toFString(text);
    EXPECT_STREQ(text.text8(), "00112233445566778899AABBCCDDEEFF");
}
