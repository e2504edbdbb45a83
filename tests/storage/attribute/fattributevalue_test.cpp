#include "tests/storage/objectfixture.h"

#include "foundation/text/cmstring.h"
#include "storage/attribute/fattributelist.h"
#include "storage/attribute/fattributevalue.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

using Value = FAttributeValue;

TEST(FAttributeValue, HoldsObjectsAsTheFlagsSay)
{
    const int before = StoredNode::alive;
    auto node = adopt(new StoredNode);
    {
        Value taken, counted, plain;
        node->addRef();
        taken.setObj(node, Value::kOwned);
        counted.setObj(node, Value::kBorrowed);
        plain.setObj(node, 0);
        EXPECT_EQ(node->getRefCount(), 3u);
        EXPECT_EQ(taken.getType(), unsigned{Value::kObject | Value::kOwned});
        EXPECT_EQ(counted.getType(), unsigned{Value::kObject | Value::kBorrowed});

        counted.setObj(node, Value::kBorrowed);
        EXPECT_EQ(node->getRefCount(), 3u) << "the object that is held already";

        auto detached = adopt(plain.detachObj());
        EXPECT_EQ(node->getRefCount(), 4u) << "who detaches gets a reference in any case";
        EXPECT_EQ(plain.getObj(), nullptr);
        auto fromTaken = adopt(taken.detachObj());
        EXPECT_EQ(node->getRefCount(), 4u);
    }
    EXPECT_EQ(node->getRefCount(), 1u);
    node = nullptr;
    EXPECT_EQ(StoredNode::alive, before);
}

TEST(FAttributeValue, ReplacesTheObjectOnlyAfterTakingTheNewOne)
{
    auto* outer = new StoredNode(1, adopt(new StoredNode(2)));
    Value value;
    value.setObj(outer, Value::kOwned);
    value.setObj(outer->next, Value::kBorrowed);
    ASSERT_NE(value.getObj(), nullptr);
    EXPECT_EQ(FCast(StoredNode, value.getObj())->number, 2) << "held by the object that went";
}

TEST(FAttributeValue, NumbersConvertAndStayInRange)
{
    Value value;
    value.setLong(-7);
    EXPECT_EQ(value.getFloat(), -7.0);
    value.setFloat(2.9);
    EXPECT_EQ(value.getLong(), 2);
    value.setFloat(1e300);
    EXPECT_EQ(value.getLong(), std::numeric_limits<long long>::max());
    value.setFloat(-1e300);
    EXPECT_EQ(value.getLong(), std::numeric_limits<long long>::min());
    value.setFloat(std::nan(""));
    EXPECT_EQ(value.getLong(), 0);
    value.setString8("7");
    EXPECT_EQ(value.getLong(), 0);
}

TEST(FAttributeValue, BorrowedTextIsAPointerUntilItIsReadAtAnotherWidth)
{
    const char* narrow = "plain";
    const char16* wide = u"wide";
    Value value;
    value.setString(narrow, true);
    EXPECT_EQ(value.getString8(), narrow);
    EXPECT_EQ(value.getType(), unsigned{Value::kString | Value::kBorrowed});
    EXPECT_EQ(ConstString(value.getString16()), ConstString(u"plain"));
    EXPECT_EQ(value.getType(), unsigned{Value::kString}) << "converted, so a text of its own";

    value.setString(wide, true);
    EXPECT_EQ(value.getString16(), wide);
    EXPECT_EQ(value.getType(),
              unsigned{Value::kString | Value::kBorrowed | Value::kWide | Value::kBorrowedWide});
    value.makeStringOwner();
    EXPECT_NE(value.getString16(), wide);
    EXPECT_EQ(value.getType(), unsigned{Value::kString | Value::kWide});
    EXPECT_TRUE(value.isWide());
}

TEST(FAttributeValue, AStringObjectAnswersStringReads)
{
    Value value;
    value.setObj(new CmString("text"), Value::kOwned);
    EXPECT_TRUE(value.isString());
    EXPECT_STREQ(value.getString8(), "text");
    FString copy;
    EXPECT_TRUE(value.getString(copy));
    EXPECT_EQ(copy, ConstString("text"));
    value.setObj(new StoredNode, Value::kOwned);
    EXPECT_FALSE(value.isString());
    EXPECT_EQ(value.getString8(), nullptr);
}

TEST(FAttributeValue, ACopyHasItsOwnTextAndTreeAndSharesObjects)
{
    Value text;
    text.setString8("one");
    Value textCopy(text);
    textCopy.setString8("two");
    EXPECT_STREQ(text.getString8(), "one");

    auto tree = adopt(new FAttributes);
    tree->set("a", 1);
    Value sub;
    sub.setObj(tree, Value::kBorrowed);
    Value subCopy;
    subCopy = sub;
    tree->set("a", 2);
    EXPECT_EQ(FCast(FAttributes, subCopy.getObj())->getInt("a"), 1);

    auto node = adopt(new StoredNode);
    Value object;
    object.setObj(node, Value::kBorrowed);
    {
        const Value objectCopy(object);
        EXPECT_EQ(objectCopy.getObj(), node.get());
        EXPECT_EQ(node->getRefCount(), 3u);
    }
    EXPECT_EQ(node->getRefCount(), 2u);
}

template <class List>
std::string keysOf(const List& list)
{
    std::string keys;
    for (int i = 0; i < list.total(); i++)
        keys += list.entryAt(i)->getKey() + std::string(" ");
    return keys;
}

TEST(FAttributeList, SortsOrKeepsTheOrderAndReplacesInPlace)
{
    FStringAttributeList sorted;
    FStringAttributeArray unsorted;
    for (const char* key : {"m", "c", "z", "a", "c"})
    {
        sorted.setStringAttribute(key, key, false);
        unsorted.setStringAttribute(key, key, false);
    }
    EXPECT_EQ(keysOf(sorted), "a c m z ");
    EXPECT_EQ(keysOf(unsorted), "m c z a ");
    unsorted.setLongAttribute("c", 5);
    EXPECT_EQ(keysOf(unsorted), "m c z a ");
    EXPECT_EQ(unsorted.getAttribute("c")->getLong(), 5);
    EXPECT_EQ(sorted.getAttribute("b"), nullptr);
    EXPECT_TRUE(sorted.contains("z"));
    EXPECT_FALSE(sorted.removeAttribute("zz"));
    EXPECT_TRUE(sorted.removeAttribute("a"));
    EXPECT_EQ(keysOf(sorted), "c m z ");

    FStringAttributeList copy(sorted);
    copy.setLongAttribute("c", 1);
    EXPECT_STREQ(sorted.getAttribute("c")->getString8(), "c") << "the copy has entries of its own";
}

TEST(FAttributeList, FindsEveryKeyInWhateverOrderTheyCome)
{
    FIntAttributeList list;
    for (unsigned i = 0; i < 1000; i++)
        list.setLongAttribute(i * 617 % 1000 * 3, i);
    EXPECT_EQ(list.total(), 1000);
    for (unsigned i = 0; i < 1000; i++)
    {
        const FIntIDAttribute* found = list.getAttribute(i * 617 % 1000 * 3);
        ASSERT_NE(found, nullptr);
        EXPECT_EQ(found->getLong(), i);
        EXPECT_EQ(list.getAttribute(i * 3 + 1), nullptr);
    }
}
