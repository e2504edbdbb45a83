#include "containers/match/cmregularexpression.h"
#include "containers/value/cmbuffer.h"
#include "containers/value/cmtime.h"
#include "containers/value/cmvariant.h"
#include "foundation/object/fvariant.h"
#include "foundation/object/iptr.h"
#include "foundation/text/string.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/fnewarchive.h"
#include "storage/stream/fmemorystream.h"

#include <gtest/gtest.h>

#include <string>

namespace
{
template <class Object>
bool storeAndRestore(const Object& object, Object& restored)
{
    FAttributes tree;
    return object.storeAttributes(tree) && restored.restoreAttributes(tree);
}

template <class Object>
bool externalizeAndInternalize(const Object& object, Object& restored)
{
    auto stream = adopt(new FMemoryStream);
    {
        FNewArchive writer(stream, true);
        if (!object.externalize(writer))
            return false;
    }
    stream->rewind();
    FNewArchive reader(stream, false);
    return restored.internalize(reader);
}

std::string bytesOf(const FMemoryStream& stream)
{
    return std::string(stream.getData() ? stream.getData() : "", static_cast<size_t>(stream.getSize()));
}
} // namespace

TEST(ValueForms, DatesTimesBuffersAndPatternsComeBackAsTheyWere)
{
    const CmDate date(2451911u);
    CmDate dates[2] = {CmDate(0u), CmDate(0u)};
    EXPECT_TRUE(storeAndRestore(date, dates[0]) && externalizeAndInternalize(date, dates[1]));
    EXPECT_TRUE(dates[0] == date && dates[1] == date);

    const CmTime time(3000000000u);
    CmTime times[2] = {CmTime(0u), CmTime(0u)};
    EXPECT_TRUE(storeAndRestore(time, times[0]) && externalizeAndInternalize(time, times[1]));
    EXPECT_TRUE(times[0] == time && times[1] == time);

    CmBuffer buffer("abcdef", 6);
    buffer.setFillSize(4);
    CmBuffer buffers[2];
    EXPECT_TRUE(storeAndRestore(buffer, buffers[0]) && externalizeAndInternalize(buffer, buffers[1]));
    for (const CmBuffer& restored : buffers)
    {
        EXPECT_TRUE(restored.isEqual(&buffer));
        EXPECT_EQ(restored.getFillSize(), 4u);
    }

    const CmRegularExpression pattern(u"*.wav", false);
    CmRegularExpression patterns[2];
    EXPECT_TRUE(storeAndRestore(pattern, patterns[0]) && externalizeAndInternalize(pattern, patterns[1]));
    EXPECT_TRUE(patterns[0].isEqual(&pattern) && patterns[1].isEqual(&pattern));
}

TEST(ValueForms, VariantsKeepTheirKind)
{
    auto date = adopt(new CmDate(77u));
    CmVariant object, narrow;
    object.setUnknown(static_cast<IDate*>(date));
    narrow.setString8("abc", true);
    const CmVariant variants[] = {CmVariant(), CmVariant(-5), CmVariant(2.5), CmVariant(u"text", true),
                                  narrow,      object};
    for (const CmVariant& variant : variants)
    {
        CmVariant restored(99);
        EXPECT_TRUE(storeAndRestore(variant, restored)) << &variant - variants;
        EXPECT_TRUE(restored == variant) << &variant - variants;
        EXPECT_EQ(restored.isInteger(), variant.isInteger());
    }
    FAttributes tree;
    CmVariant restored;
    EXPECT_FALSE(restored.restoreAttributes(tree));
    for (int type : {3, 77, 16, -1})
    {
        tree.set("type", type);
        EXPECT_FALSE(restored.restoreAttributes(tree)) << type;
        EXPECT_TRUE(restored.isEmpty());
    }
}

TEST(ValueForms, MemoryStreamsComeBackRewound)
{
    FMemoryStream stream;
    stream.writeRaw("abcdef", 6);
    FMemoryStream restored[2];
    EXPECT_TRUE(storeAndRestore(stream, restored[0]) && externalizeAndInternalize(stream, restored[1]));
    for (FMemoryStream& copy : restored)
    {
        EXPECT_EQ(bytesOf(copy), "abcdef");
        EXPECT_EQ(copy.tell(), 0);
    }
    FMemoryStream empty;
    EXPECT_TRUE(externalizeAndInternalize(empty, restored[1]));
    EXPECT_EQ(bytesOf(restored[1]), "abcdef") << "a stored size of 0 changes nothing";

    FAttributes tree;
    tree.setBinary("key", "xyz", 3);
    char block[8] = "old";
    FMemoryStream foreign(block, 8);
    EXPECT_FALSE(foreign.fromAttributes("other key", tree));
    EXPECT_TRUE(foreign.fromAttributes("key", tree));
    EXPECT_EQ(bytesOf(foreign), "xyz");
    EXPECT_TRUE(foreign.ownsData());
    EXPECT_STREQ(block, "old");
}

TEST(ValueForms, SizesThatTheFileDoesNotHoldAreRefused)
{
    for (const std::string& bytes : {std::string("\xFF\xFF\xFF\x7F"
                                                 "abc"),
                                     std::string("\xFF\xFF\xFF\xFF"
                                                 "abc"),
                                     std::string("ab")})
    {
        auto stream = adopt(new FMemoryStream);
        stream->writeRaw(bytes.data(), static_cast<int64>(bytes.size()));
        stream->rewind();
        FNewArchive reader(stream, false);
        FMemoryStream restored;
        EXPECT_FALSE(restored.internalize(reader));
        stream->rewind();
        CmBuffer buffer;
        EXPECT_FALSE(buffer.internalize(reader));
        EXPECT_EQ(buffer.getSize(), 0u);
    }
}
