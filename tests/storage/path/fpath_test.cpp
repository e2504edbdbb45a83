#include "storage/path/fpath.h"

#include "foundation/object/iptr.h"
#include "storage/path/fnpath.h"
#include "storage/path/fpathcompare.h"
#include "tests/storage/filefixture.h"

#include <algorithm>
#include <vector>

namespace
{
std::string partsOf(const FPath& path)
{
    return utf8(path.getPathName()) + "|" + utf8(path.getName());
}

FPath named(const char16* name, const char* extension = nullptr)
{
    FPath path(u"x", static_cast<const FPath*>(nullptr), FPath::kFile);
    if (extension)
        path.setFileType(FFileType(nullptr, extension, extension, 0, nullptr));
    path.setName(name);
    return path;
}

TEST(FPath, TextWithoutDelimiterIsAFolderPart)
{
    EXPECT_EQ(partsOf(FPath(u"a", 0)), "a|");
    EXPECT_EQ(partsOf(FPath(u"a/b/", 0)), "a/|b");
    EXPECT_EQ(partsOf(FPath(u"/a", 0)), "/|a");
    FPath root(u"/", 0);
    EXPECT_EQ(partsOf(root), "/|");
    EXPECT_TRUE(root.isFolder());
    FPath empty(u"/x", 0);
    EXPECT_FALSE(empty.fromString(u"", 2));
    EXPECT_TRUE(empty.isLink()) << "what is given is stored first";
}

TEST(FPath, ChildrenAndTheirFolders)
{
    const FPath folder(u"/a/b", FPath::kFolder);
    EXPECT_EQ(partsOf(FPath(u"c", &folder, FPath::kFile)), "/a/b/|c");
    EXPECT_EQ(partsOf(FPath(u"c", u"x", FPath::kFile)), "x/|c");
    EXPECT_EQ(partsOf(FPath(u"../c", &folder, FPath::kFile)), "/a/b/|.._c") << "a name never leads elsewhere";
}

TEST(FPath, ExtensionIsWhatStandsBehindTheLastDot)
{
    struct Row
    {
        const char16* name;
        const char* type;
        bool useFileType;
        int index;
    };
    const Row rows[] = {
        {u"a.txt", nullptr, false, 1}, {u".profile", nullptr, false, -1}, {u"a.b c", nullptr, false, -1},
        {u"a. b", nullptr, false, -1}, {u"a.b.c", nullptr, false, 3},     {u"noext", nullptr, false, -1},
        {u"a.txt", "bin", true, -1},   {u"a.BIN", "bin", true, 1},        {u"a.txt", "bin", false, 1},
        {u"a.txt", nullptr, true, 1},  {u"a.b c", "b c", true, 1},
    };
    for (const Row& row : rows)
        EXPECT_EQ(named(row.name, row.type).getExtensionIndex(row.useFileType), row.index) << utf8(row.name);

    FString text(u"before");
    EXPECT_FALSE(named(u"noext").getExtension(text));
    EXPECT_TRUE(text.isEmpty());
    EXPECT_TRUE(named(u"a.B").getExtension(text));
    EXPECT_EQ(utf8(text), "B");
    named(u"noext").getNameWithoutExtension(text, false);
    EXPECT_EQ(utf8(text), "noext");
    named(u"a.txt", "bin").getNameWithoutExtension(text, true);
    EXPECT_EQ(utf8(text), "a.txt");
}

TEST(FPath, TypeBringsItsExtension)
{
    const FFileType xml(nullptr, "xml", "xml", 0, "XML");
    const FFileType backup(nullptr, "xml.backup", "xml.backup", 0, "Backup");
    FPath path = named(u"a.txt");
    path.setFileType(xml);
    EXPECT_EQ(utf8(path.getName()), "a.xml");
    path.setFileType(backup);
    EXPECT_EQ(utf8(path.getName()), "a.xml.backup");
    EXPECT_TRUE(path.updateExtension(false));
    EXPECT_EQ(utf8(path.getName()), "a.xml.backup") << "an extension with a dot is known again";
    path.setFileType(FFileType());
    EXPECT_EQ(utf8(path.getName()), "a.xml.backup") << "a type without an extension changes nothing";

    FPath dotted = named(u"Song 2.1", "xml");
    EXPECT_TRUE(dotted.updateExtension(false));
    EXPECT_EQ(utf8(dotted.getName()), "Song 2.1.xml")
        << "without replacing, what stands there is part of the name";

    FPath folder(u"/a.b", FPath::kFolder);
    folder.setFileType(xml);
    EXPECT_EQ(utf8(folder.getName()), "a.b");
    EXPECT_FALSE(folder.updateExtension(true));
}

TEST(FPath, IsInAFolderByComponents)
{
    const FPath folder(u"/a/b", FPath::kFolder);
    EXPECT_TRUE(FPath(u"/a/b/c", 0).isInDir(&folder));
    EXPECT_TRUE(FPath(u"/a/b/c/d", 0).isInDir(&folder));
    EXPECT_FALSE(FPath(u"/a/bc", 0).isInDir(&folder));
    EXPECT_FALSE(FPath(u"/a/B/c", 0).isInDir(&folder)) << "case counts";
    EXPECT_FALSE(folder.isInDir(&folder)) << "a folder isn't in itself";
    const FPath root(u"/", 1);
    EXPECT_TRUE(folder.isInDir(&root));
    EXPECT_FALSE(FPath(u"a/b", 0).isInDir(&root));
}

TEST(FPath, SortsLikeATree)
{
    std::vector<const char16*> texts = {u"/a.b", u"/a/b", u"/b", u"/a", u"/a/", u"/ab", u"/a/b/c"};
    std::sort(texts.begin(), texts.end(),
              [](const char16* left, const char16* right)
              { return FPathCompare::compareTreeStyle(left, right, -1) < 0; });
    std::string order;
    for (const char16* text : texts)
        order += utf8(text) + " ";
    EXPECT_EQ(order, "/a /a/ /a/b /a/b/c /a.b /ab /b ");

    EXPECT_EQ(FPathCompare::compareTreeStyle("abc", "abd", 2), 0);
    EXPECT_EQ(FPathCompare::compareTreeStyle("ab", u"abd", 2), 0) << "the whole stretch is common";
    EXPECT_EQ(FPathCompare::compareTreeStyle("ab", "abd", 3), -1) << "the limit lies beyond the shorter text";
    EXPECT_EQ(FPathCompare::compareTreeStyle("aB", "ab", -1, false), 0);

    const FPath left(u"/a/x", 0), right(u"/a/y", 0);
    EXPECT_EQ(left.compare(&right), -1);
    EXPECT_EQ(FPathCompare::compareTreeStyle(&left, &right, false), 0);
    const CmObject noPath;
    EXPECT_EQ(left.compare(&noPath), -1);
}

TEST(FPath, EqualPathsHaveEqualHashes)
{
    const FPath path(u"/a/b", 0);
    const FNPath native(u"/a/b", 1);
    EXPECT_TRUE(path.isEqual(&native));
    EXPECT_EQ(path.hash(1009), native.hash(1009));
    // ('/' = 47, 'a' = 97, 'b' = 98): the folder part first, the running value kept.
    unsigned expected = 0;
    for (const unsigned c : {47u, 97u, 47u, 98u})
        expected = (c + expected * 64) % 1009;
    EXPECT_EQ(path.hash(1009), expected);
    EXPECT_FALSE(path == FPath(u"/A/b", 0));
}

TEST(FPath, SpeaksToComponentsByText)
{
    FPath path(u"/a/b.txt", FPath::kFile);
    void* view = nullptr;
    ASSERT_EQ(path.queryInterface(IPath::iid, &view), kResultOk);
    IPath* outside = static_cast<IPath*>(view);
    char16 text[kPathBufferSize];
    EXPECT_EQ(outside->getFullPath(text), kPathOk);
    EXPECT_EQ(utf8(text), "/a/b.txt");
    EXPECT_EQ(outside->getFileExtension(text), kPathOk);
    EXPECT_EQ(utf8(text), "txt");
    EXPECT_EQ(outside->getNameWithoutExt(text), kPathOk);
    EXPECT_EQ(utf8(text), "b");
    EXPECT_EQ(outside->getFullPath(nullptr), kPathInvalidArgument);
    EXPECT_EQ(outside->goUp(), kPathOk);
    EXPECT_EQ(outside->goDown(u"c", FPath::kFile), kPathOk);
    EXPECT_EQ(outside->getFileExtension(text), kPathFailed);

    FFileTypeInfo info;
    info.set(7, "wav", "Wave");
    EXPECT_EQ(outside->setFileType(&info), kPathOk);
    EXPECT_EQ(fullPathOf(path), "/a/c.wav");
    FFileTypeInfo told;
    EXPECT_EQ(outside->getFileType(&told), kPathOk);
    EXPECT_STREQ(told.name, "Wave");

    IPath* copy = nullptr;
    EXPECT_EQ(outside->newCopy(&copy), kPathOk);
    EXPECT_EQ(fullPathOf(FNPath(copy)), "/a/c.wav");
    copy->release();
    EXPECT_EQ(outside->setFullPath(std::u16string(2000, u'x').c_str(), 0), kPathOk);
    EXPECT_EQ(outside->getFullPath(text), kPathFailed) << "a text that doesn't fit isn't cut";
    EXPECT_EQ(text[0], 0);
    outside->release();
}

TEST(FFileTypeInfo, CutsLongTexts)
{
    FFileTypeInfo info;
    info.set(1, std::string(100, 'x').c_str(), nullptr);
    EXPECT_EQ(std::string(info.extension).size(), 63u);
    EXPECT_STREQ(info.name, "");
}
} // namespace
