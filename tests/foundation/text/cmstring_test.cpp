#include "containers/sequence/cmarray.h"
#include "containers/sequence/cmiterator.h"
#include "foundation/object/stringhash.h"
#include "foundation/text/cmstringwithid.h"
#include "foundation/text/cmtmpstring.h"
#include "foundation/text/stringobject.h"
#include "storage/attribute/fattributes.h"
#include "texts.h"

#include <gtest/gtest.h>
#include <vector>

namespace
{
using Pieces = std::vector<std::string>;

Pieces split(const ConstString& text, const ConstString& delimiter, bool trim, bool dropEmptyLast)
{
    CmArray array;
    const int count = CmString::split(text, array, delimiter, trim, dropEmptyLast);
    Pieces result;
    for (int i = 0; i < array.total(); ++i)
        result.push_back(shape(*FCast(CmString, array.at(i))));
    EXPECT_EQ(count, array.total());
    EXPECT_EQ(array.getOwnership(), CmContainer::kTaken);
    return result;
}
} // namespace

TEST(CmString, SplitsAndDropsWhatIsEmpty)
{
    EXPECT_EQ(split("a,,b,", ",", false, true), (Pieces{"narrow:a", "narrow:b"}));
    EXPECT_EQ(split("a,,b,", ",", false, false), (Pieces{"narrow:a", "narrow:b", "narrow:"}));
    EXPECT_EQ(split(u"x; y ;  ", "; ", true, true), (Pieces{"wide:x", "wide:y"}));
    EXPECT_EQ(split("x , y", u",", false, true), (Pieces{"narrow:x ", "narrow: y"}));
    EXPECT_EQ(split("  ", ",", true, true), Pieces{});
    EXPECT_EQ(split("", ",", false, true), Pieces{});
    EXPECT_EQ(split("whole", "", false, true), Pieces{"narrow:whole"});
    EXPECT_EQ(split("aäb", u"ä", false, true).size(), 1u) << "these bytes are no such character by default";
    CmArray array;
    EXPECT_EQ(CmString::split8("a/b", array, "/"), 2);
    EXPECT_EQ(CmString::split16(u"c/d", array, u"/"), 4) << "pieces join what is there";
}

TEST(CmString, IsEqualAndOrderedByItsCharacters)
{
    const CmString narrow("abc"), wideText(u"abc"), other("abd");
    const CmObject object;
    EXPECT_TRUE(narrow.isEqual(&wideText));
    EXPECT_FALSE(narrow.isEqual(&other));
    EXPECT_FALSE(narrow.isEqual(&object));
    EXPECT_LT(narrow.compare(static_cast<const CmObject*>(&other)), 0);
    EXPECT_EQ(narrow.hash(1021), hashString8("abc", 1021));
    EXPECT_EQ(wideText.hash(1021), hashString16(u"abc", 1021));
    EXPECT_TRUE(wideText.isWideString()) << "hashing must not convert";
}

TEST(CmString, IsEqualWhereEveryCharacterIs)
{
    std::u16string text;
    for (size_t length = 0; length <= 40; text.push_back(static_cast<char16>(u'A' + length++)))
    {
        const CmString whole(text.c_str()), same(text.c_str()), longer((text + u'x').c_str());
        EXPECT_TRUE(whole.isEqual(&same)) << length;
        EXPECT_FALSE(whole.isEqual(&longer)) << length;
        for (size_t place = 0; place < length; place++)
        {
            std::u16string changed = text;
            changed[place] = static_cast<char16>(changed[place] ^ 0x100);
            const CmString other(changed.c_str());
            EXPECT_FALSE(whole.isEqual(&other)) << length << " characters, changed at " << place;
        }
    }
}

TEST(CmString, CopiesAsAnObject)
{
    CmStringWithId original("text", 7);
    const auto copy = adopt(original.newCopy());
    const auto* text = FCast(CmStringWithId, copy.get());
    ASSERT_TRUE(text);
    EXPECT_EQ(text->getId(), 7);
    EXPECT_EQ(*text, "text");
    EXPECT_NE(text->text(), original.text());
}

TEST(CmString, OffersItsInterfaces)
{
    CmString text;
    StringObject object;
    for (FUnknown* unknown : {static_cast<FUnknown*>(static_cast<IString*>(&text)),
                              static_cast<FUnknown*>(static_cast<IString*>(&object))})
    {
        IString* string = askInterface<IString>(unknown);
        IStringResult* result = askInterface<IStringResult>(unknown);
        ASSERT_TRUE(string && result);
        result->setText("narrow");
        EXPECT_FALSE(string->isWideString());
        EXPECT_STREQ(string->getText8(), "narrow");
        string->setText16(u"wide");
        EXPECT_TRUE(string->isWideString());
        EXPECT_EQ(ConstString(string->getText16()), u"wide");
        string->take(strdup("taken"), false);
        EXPECT_STREQ(string->getText8(), "taken");
        string->release();
        result->release();
    }
    EXPECT_EQ(text.getRefCount(), 1u);
    EXPECT_EQ(object.getRefCount(), 1u);
}

TEST(CmString, StoresItsTextAtItsWidth)
{
    FAttributes attributes;
    for (const ConstString& each : {ConstString("narrow"), ConstString(u"größe")})
    {
        CmString stored(each), restored("before");
        EXPECT_TRUE(stored.storeAttributes(attributes));
        EXPECT_TRUE(restored.restoreAttributes(attributes));
        EXPECT_EQ(shape(restored), shape(each));

        String text;
        EXPECT_TRUE(stored.toAttributes(&attributes, "key"));
        EXPECT_TRUE(text.fromAttributes(&attributes, "key"));
        EXPECT_EQ(shape(text), shape(each));
    }
    String text("kept");
    EXPECT_FALSE(text.fromAttributes(&attributes, "missing"));
    EXPECT_EQ(text, "kept");
}

TEST(CmTmpString, BorrowsATextForALookup)
{
    const char16* text = u"needle";
    CmArray array;
    array.takeElements();
    array.add(new CmString(u"hay"));
    array.add(new CmString(u"needle"));
    const CmTmpString key(text);
    EXPECT_EQ(key.text(), text);
    EXPECT_EQ(array.getIndex(&key), 1);
    const auto copy = adopt(key.newCopy());
    EXPECT_NE(FCast(CmString, copy.get())->text(), text) << "a copy as an object owns its text";
    EXPECT_EQ(*FCast(CmString, copy.get()), text);
}
