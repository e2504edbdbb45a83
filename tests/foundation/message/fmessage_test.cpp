#include "foundation/message/fmessage.h"
#include "foundation/object/classfactory.h"
#include "foundation/object/iptr.h"

#include <gtest/gtest.h>

TEST(FMessage, IsKnownByItsTypeCaseIncluded)
{
    FMessage message("Idle");
    EXPECT_TRUE(message.isType("Idle"));
    EXPECT_FALSE(message.isType("idle"));
    EXPECT_FALSE(message.isType(nullptr));
    message.setMessageID("Quit");
    EXPECT_TRUE(message.hasMessageID("Quit"));
    EXPECT_STREQ(message.getMessageID(), "Quit");
    EXPECT_FALSE(FMessage().isType("Quit"));
}

TEST(FMessage, CarriesNumbers)
{
    FMessage message("numbers");
    message.addInt("i", 9000000000LL);
    message.addFloat1("f", 0.5);
    message.addData("d", 7);
    int64 integer = 3;
    double number = 3;
    EXPECT_EQ(message.getInt("i", &integer), 0);
    EXPECT_EQ(integer, 9000000000LL);
    EXPECT_EQ(message.getFloat("f", &number), 0);
    EXPECT_EQ(number, 0.5);
    EXPECT_EQ(message.getData("d"), 7);
    EXPECT_EQ(message.getFloat("d"), 7.0);

    EXPECT_EQ(message.getInt("absent", &integer), -1);
    EXPECT_EQ(integer, 9000000000LL) << "a default stays";
    message.addString("text", u"12");
    EXPECT_EQ(message.getFloat("text", &number), -1);
    EXPECT_EQ(message.getData("absent"), 0);

    message.addInt("i", 1);
    EXPECT_EQ(message.getData("i"), 1) << "a second value takes the place of the first";
    message.remove("i");
    EXPECT_FALSE(message.contains("i"));
    EXPECT_TRUE(message.contains("d"));
}

TEST(FMessage, CopiesTextsOfEitherWidth)
{
    FMessage message("texts");
    char narrow[] = "narrow";
    char16 wide[] = u"w\u00efde";
    message.addString8("8", narrow);
    message.addString16("16", wide);
    message.addTString("t", ConstString(wide));
    narrow[0] = 'X';
    wide[0] = u'X';
    EXPECT_STREQ(message.getString8("8"), "narrow");
    EXPECT_EQ(std::u16string(message.getString16("16")), u"w\u00efde");
    EXPECT_EQ(std::u16string(message.getString16("8")), u"narrow");
    EXPECT_EQ(message.getString("t").compare(ConstString(u"w\u00efde")), 0);
    String text(u"old");
    EXPECT_EQ(message.getTString("16", text), 0);
    EXPECT_EQ(text.compare(ConstString(u"w\u00efde")), 0);
    EXPECT_EQ(message.getTString("absent", text), -1);
    EXPECT_TRUE(text.isEmpty());
    EXPECT_EQ(message.getString8("absent"), nullptr);
    EXPECT_EQ(message.getString16("absent"), nullptr);
    EXPECT_TRUE(message.getString("absent").isEmpty());
}

TEST(FMessage, HoldsObjectsAsAsked)
{
    CmObject retained, borrowed, unknown;
    int plain = 0;
    {
        FMessage message("objects");
        message.add("r", &retained, true);
        message.add("b", &borrowed, false);
        message.addUnknown("u", static_cast<IDependent*>(&unknown));
        message.addPointer("p", &plain);
        EXPECT_EQ(message.get("r"), &retained);
        EXPECT_EQ(message.get("b"), &borrowed);
        EXPECT_EQ(toCmObject(message.getUnknown("u")), &unknown);
        EXPECT_EQ(message.getPointer("p"), &plain);
        EXPECT_EQ(message.get("absent"), nullptr);
        EXPECT_EQ(message.getUnknown("absent"), nullptr);
        EXPECT_EQ(message.getPointer("absent"), nullptr);
        EXPECT_EQ(retained.getRefCount(), 2u);
        EXPECT_EQ(borrowed.getRefCount(), 1u);
        EXPECT_EQ(unknown.getRefCount(), 2u);

        const auto copy = adopt(static_cast<FMessage*>(message.newCopy()));
        EXPECT_TRUE(copy->isType("objects"));
        EXPECT_EQ(copy->get("r"), &retained);
        copy->addInt("own", 1);
        EXPECT_FALSE(message.contains("own"));
        EXPECT_EQ(retained.getRefCount(), 3u);
    }
    EXPECT_EQ(retained.getRefCount(), 1u);
    EXPECT_EQ(unknown.getRefCount(), 1u);
}

TEST(FMessage, AnswersToItsInterfaces)
{
    FMessage message("interfaces");
    const auto second = adopt(askInterface<IMessage2>(static_cast<CmObject*>(&message)));
    ASSERT_TRUE(second);
    const auto first = adopt(askInterface<IMessage>(second.get()));
    ASSERT_TRUE(first);
    EXPECT_TRUE(first->hasMessageID("interfaces"));
}
