#include "containers/value/cmdate.h"
#include "containers/value/cmvariant.h"
#include "containers/value/cmvariantoperation.h"
#include "foundation/object/fvariant.h"
#include "foundation/object/iptr.h"
#include "foundation/text/string.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

namespace
{
String textOf(const CmVariant& variant)
{
    String text;
    variant.getString(text);
    return text;
}

CmVariant evaluate(int operation, const CmVariant& left, const CmVariant& right)
{
    auto node = adopt(new CmVariantOperation(operation));
    node->setOperands(adopt(new CmVariantConstant(left)), adopt(new CmVariantConstant(right)));
    return node->evaluate(nullptr);
}

CmVariant text(const char16* characters)
{
    return CmVariant(characters, true);
}
} // namespace

TEST(CmVariant, ReadsItsValueAsNumberOrText)
{
    EXPECT_EQ(CmVariant(42).getFloat(), 42.0);
    EXPECT_EQ(CmVariant(-2.9).getLong(), -2);
    EXPECT_EQ(CmVariant(1e300).getLong(), std::numeric_limits<int64>::max());
    EXPECT_EQ(CmVariant(std::nan("")).getLong(), 0);
    EXPECT_EQ(text(u"12.5 s").getFloat(), 12.5);
    EXPECT_EQ(text(u"x1").getLong(), 0);
    EXPECT_EQ(textOf(CmVariant(42)), "42");
    EXPECT_EQ(textOf(CmVariant(2.5)), "2.5");
    String left("left");
    EXPECT_FALSE(CmVariant().getString(left));
    EXPECT_TRUE(left.isEmpty());
}

TEST(CmVariant, BorrowsOrOwnsTexts)
{
    char16 characters[] = u"abc";
    CmVariant borrowed(characters, false), owned(characters, true);
    EXPECT_FALSE(borrowed.isOwner());
    CmVariant copy(borrowed), emancipated;
    emancipated.setString16(characters, false);
    emancipated.emancipate();
    characters[0] = u'X';
    EXPECT_EQ(textOf(borrowed), u"Xbc");
    for (const CmVariant* variant : {&owned, &copy, &emancipated})
    {
        EXPECT_EQ(textOf(*variant), u"abc");
        EXPECT_TRUE(variant->isOwner());
    }
    owned.setString(nullptr, true);
    EXPECT_TRUE(owned.isEmpty());
}

TEST(CmVariant, CountsTheReferencesOfObjects)
{
    auto date = adopt(new CmDate(5u));
    {
        CmVariant variant;
        variant.setUnknown(static_cast<IDate*>(date));
        EXPECT_EQ(date->getRefCount(), 1u) << "borrowed";
        EXPECT_EQ(variant.getObject("CmDate"), date.get());
        EXPECT_EQ(variant.getObject("CmTime"), nullptr);

        CmVariant copy(variant);
        FVariant plain;
        variant.assignTo(plain);
        EXPECT_EQ(date->getRefCount(), 3u);
        variant.emancipate();
        variant.emancipate();
        EXPECT_EQ(date->getRefCount(), 4u);
        copy = CmVariant(1);
        EXPECT_EQ(date->getRefCount(), 3u);
        variant = plain;
        EXPECT_EQ(date->getRefCount(), 3u);
    }
    EXPECT_EQ(date->getRefCount(), 1u);
}

TEST(CmVariant, MayBeAssignedFromItself)
{
    CmVariant variant = text(u"long enough to be freed");
    CmVariant& alias = variant;
    variant = alias;
    variant = static_cast<FVariant>(variant);
    EXPECT_EQ(textOf(variant), u"long enough to be freed");
}

TEST(CmVariant, SortsNothingBeforeNumbersBeforeTextsBeforeObjects)
{
    auto date = adopt(new CmDate(5u));
    CmVariant object;
    object.setUnknown(static_cast<IDate*>(date));
    const CmVariant ascending[] = {CmVariant(),     CmVariant(std::nan("")),
                                   CmVariant(-1.5), CmVariant(2),
                                   CmVariant(2.5),  text(u""),
                                   text(u"10"),     text(u"9"),
                                   object};
    for (const CmVariant& left : ascending)
        for (const CmVariant& right : ascending)
        {
            const auto places = &left - &right;
            const int order = left.compare(&right);
            EXPECT_EQ(order < 0, places < 0) << &left - ascending << " " << &right - ascending;
            EXPECT_EQ(order > 0, places > 0);
        }
}

TEST(CmVariant, EqualValuesOfAnyKindHashAlike)
{
    CmVariant narrow;
    narrow.setString8("gr\x9F", true);
    String wide("gr\x9F");
    wide.toWideString();
    const CmVariant pairs[][2] = {{CmVariant(3), CmVariant(3.0)}, {narrow, text(wide.text16())}};
    for (const auto& pair : pairs)
    {
        EXPECT_TRUE(pair[0].isEqual(&pair[1]));
        EXPECT_EQ(pair[0].hash(1009), pair[1].hash(1009));
    }
}

TEST(CmVariantOperation, ComputesComparesAndMatches)
{
    using Node = FOperationNode;
    EXPECT_EQ(evaluate(Node::kAdd, CmVariant(2), CmVariant(3)), CmVariant(5));
    EXPECT_TRUE(evaluate(Node::kMultiply, CmVariant(2), CmVariant(3)).isInteger());
    EXPECT_EQ(evaluate(Node::kSubtract, CmVariant(2), CmVariant(0.5)), CmVariant(1.5));
    EXPECT_EQ(evaluate(Node::kDivide, CmVariant(7), CmVariant(0)), CmVariant(7));
    const CmVariant least(std::numeric_limits<int64>::min());
    EXPECT_EQ(evaluate(Node::kDivide, least, CmVariant(-1)), least);
    EXPECT_EQ(textOf(evaluate(Node::kAdd, text(u"a"), CmVariant(1))), u"a1");
    EXPECT_EQ(evaluate(Node::kLess, CmVariant(1), CmVariant(2)), CmVariant(1));
    EXPECT_EQ(evaluate(Node::kAnd, text(u"x"), CmVariant(0)), CmVariant(0));
    EXPECT_EQ(evaluate(Node::kOr, text(u"x"), CmVariant(0)), CmVariant(1));
    EXPECT_TRUE(evaluate(99, CmVariant(1), CmVariant(1)).isEmpty());

    EXPECT_EQ(evaluate(11, text(u"song.wav"), text(u"*.wav")), CmVariant(1));
    EXPECT_EQ(evaluate(11, text(u"song.wav"), text(u"*.WAV")), CmVariant(0));
    EXPECT_TRUE(evaluate(11, text(u"song.wav"), text(u"*.wav")).isInteger());
    EXPECT_EQ(evaluate(12, text(u"song.wav"), text(u"*.mp3")), CmVariant(1));
}

TEST(CmVariantOperation, IsEmptyWithoutAnOperand)
{
    for (int operation : {1, 11, 12})
    {
        auto node = adopt(new CmVariantOperation(operation));
        EXPECT_TRUE(node->evaluate(nullptr).isEmpty());
        node->setOperands(adopt(new CmVariantConstant(CmVariant(1))), nullptr);
        EXPECT_TRUE(node->evaluate(nullptr).isEmpty());
    }
}
