#include "storage/path/fnpath.h"

#include "foundation/object/iptr.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/fnewarchive.h"
#include "storage/stream/fmemorystream.h"
#include "tests/storage/filefixture.h"

#include <string>

namespace
{
struct Row
{
    const char16* text;
    const char* path;
    const char* name;
};

std::string partsOf(const FPath& path)
{
    return utf8(path.getPathName()) + "|" + utf8(path.getName());
}

FNPath pathOf(const char* bytes)
{
    FNPath path;
    path.fromPlatformPath(bytes);
    return path;
}

TEST(FNPath, TakesTextsApart)
{
    const Row rows[] = {
        {u"/", "/", ""},      {u"/a", "/", "a"},     {u"a", "", "a"},       {u"./a/b/", "a/", "b"},
        {u"a\\b", "a/", "b"}, {u"c:/x", "C:/", "x"}, {u"1:/x", "1:/", "x"}, {u"/a/b c.txt", "/a/", "b c.txt"},
        {u"", "", ""},        {u"../x", "../", "x"}, {u".", "", "."},       {u"./", "", ""},
    };
    for (const Row& row : rows)
        EXPECT_EQ(partsOf(FNPath(row.text, 0)), std::string(row.path) + "|" + row.name) << utf8(row.text);
}

TEST(FNPath, RootIsAFolderAndTheEndOfAscending)
{
    FNPath root(u"/", FPath::kFile);
    EXPECT_TRUE(root.isFolder());
    EXPECT_TRUE(root.isRootDir());
    EXPECT_FALSE(root.ascend());

    FNPath path(u"/a/b/c", FPath::kFile);
    EXPECT_TRUE(path.ascend());
    EXPECT_EQ(partsOf(path), "/a/|b");
    EXPECT_TRUE(path.isFolder());
    EXPECT_TRUE(path.ascend());
    EXPECT_TRUE(path.ascend());
    EXPECT_TRUE(path.isRootDir());
    EXPECT_FALSE(path.ascend());
}

TEST(FNPath, FailedAscentLeavesARelativePathAsItWas)
{
    for (const char16* text : {u"a", u"a/b"})
    {
        FNPath path(text, FPath::kFile);
        const std::string before = partsOf(path);
        EXPECT_FALSE(path.ascend());
        EXPECT_EQ(partsOf(path), before);
        EXPECT_TRUE(path.isFile());
    }
}

TEST(FNPath, AscendsPastDoubledDelimitersAndKeepsThemAbove)
{
    FNPath path(u"//a///b//c", FPath::kFile);
    EXPECT_TRUE(path.ascend());
    EXPECT_EQ(partsOf(path), "//a///|b");
    EXPECT_TRUE(path.ascend());
    EXPECT_EQ(partsOf(path), "//|a");
    EXPECT_FALSE(path.ascend()) << "no folder is left to go to";
    EXPECT_EQ(partsOf(path), "//|a");
}

TEST(FNPath, DescendsIntoItself)
{
    FNPath path(u"/a", FPath::kFolder);
    path.descend(u"b", FPath::kFolder);
    path.descend(u"c.wav", FPath::kFile);
    EXPECT_EQ(partsOf(path), "/a/b/|c.wav");
    EXPECT_TRUE(path.isFile());

    FNPath relative(u"a", FPath::kFolder);
    relative.descend(u"b", FPath::kFile);
    EXPECT_EQ(fullPathOf(relative), "/a/b")
        << "a folder part without a delimiter gets one, even an empty one";
}

TEST(FNPath, BytesThatAreNoTextComeOutAsTheyWere)
{
    for (const char* bytes :
         {"/x/\xE4gypten.wav", "/x/\xED\xA0\x80", "/x/\xF0\x9F\x8E\xB5\xFF", "/\xC3/\xC3\xA4", "/a\nb\"c'"})
        EXPECT_EQ(pathOf(bytes).platformPath(), bytes);

    FString text;
    FileNameText::fromBytes("\xE4", text);
    EXPECT_EQ(text.getChar16(0), 0xDCE4) << "a stray byte is a lone surrogate";
    const FNPath again(FString(u"/x/").append(text).text16(), FPath::kFile);
    EXPECT_EQ(again.platformPath(), "/x/\xE4") << "and stays one on its way through texts";
}

TEST(FNPath, ComposesNames)
{
    EXPECT_EQ(utf8(pathOf("/A\xCC\x88.wav").getName()), "\xC3\x84.wav");
    EXPECT_EQ(FileNameText::toDecomposedBytes(u"\u00C4"), "A\xCC\x88");
}

TEST(FNPath, PlatformPathHasALimitInCharacters)
{
    std::string longest(1022, 'a');
    char buffer[FNPath::kPlatformBufferSize];
    EXPECT_TRUE(pathOf(("/" + longest).c_str()).toPlatformPath(buffer));
    EXPECT_EQ(buffer, "/" + longest);

    std::string wide;
    for (int i = 0; i < 1022; i++)
        wide += "\xE6\x97\xA5";
    EXPECT_TRUE(pathOf(("/" + wide).c_str()).toPlatformPath(buffer))
        << "three bytes a character fit the buffer";
    EXPECT_EQ(buffer, "/" + wide);

    buffer[0] = buffer[1] = 'x';
    EXPECT_FALSE(pathOf(("/" + longest + "a").c_str()).toPlatformPath(buffer));
    EXPECT_EQ(buffer[0], 0);
    EXPECT_EQ(buffer[1], 0);
}

TEST(FNPath, FindsTheWayFromOneFolderToAnother)
{
    struct Way
    {
        const char16* absolute;
        const char16* base;
        const char* relative;
    };
    const Way ways[] = {
        {u"/a/b/c", u"/a/x/", "../b/|c"}, {u"/a/x/c", u"/a/x", "|c"},        {u"/a/x/b/c", u"/a/x", "b/|c"},
        {u"/a", u"/a/x", "../../|a"},     {u"/b", u"/a/x/y", "../../../|b"}, {u"/a/x", u"/a/x", "|."},
    };
    for (const Way& way : ways)
    {
        const FNPath absolute(way.absolute, FPath::kFile);
        const FNPath base(way.base, FPath::kFolder);
        FNPath relative;
        ASSERT_TRUE(relative.assignRelative(&absolute, &base));
        EXPECT_EQ(partsOf(relative), way.relative);
        EXPECT_TRUE(relative.makeAbsolute(&base));
        EXPECT_EQ(fullPathOf(relative), fullPathOf(absolute)) << "and back";
    }
    FNPath path(u"/a/b", FPath::kLink);
    const FNPath base(u"/a", FPath::kFolder), elsewhere(u"x/y", FPath::kFolder);
    FNPath way(u"z.abc", FPath::kFile);
    path.setFileType(FFileType("text/x", nullptr, nullptr, 0, "X"));
    EXPECT_TRUE(way.assignRelative(&path, &elsewhere));
    EXPECT_EQ(partsOf(way), "/a/|b") << "nothing in common";
    for (const FNPath* from : {&base, static_cast<const FNPath*>(&path)})
    {
        way = FNPath(u"z.abc", FPath::kFile);
        EXPECT_TRUE(way.assignRelative(&path, from));
        EXPECT_TRUE(way.isLink());
        EXPECT_EQ(utf8(way.getKnownFileType().getName()), "X");
    }
    EXPECT_FALSE(path.assignRelative(nullptr, &base));
    EXPECT_FALSE(path.assignRelative(&path, nullptr));
    EXPECT_TRUE(path.makeRelative(&base));
    EXPECT_EQ(partsOf(path), "|b");
}

TEST(FNPath, MakesRelativePathsAbsolute)
{
    FNPath base(u"/a/x", FPath::kFolder);
    FNPath relative(u"../b/c.txt", FPath::kFile);
    EXPECT_EQ(relative.countAscendLevels(), 1);
    EXPECT_EQ(fullPathOf(FNPath(&base, &relative)), "/a/b/c.txt");
    EXPECT_EQ(FNPath(u"../../../c", 0).countAscendLevels(), 3);

    const FNPath absolute(u"/q", FPath::kFile);
    EXPECT_EQ(absolute.createAbsolutePath(&base), nullptr);
    for (const auto& [text, result] :
         {std::pair(u".", "/a/x"), std::pair(u"..", "/a"), std::pair(u"../..", "/"),
          std::pair(u"../../../../b", "/b"), std::pair(u"y/.", "/a/x"), std::pair(u"y/..", "/a"),
          std::pair(u"y/z/w", "/a/x/y/z/w"), std::pair(u"y//z///w", "/a/x/y/z/w"),
          std::pair(u"..//y", "/a/y")})
    {
        const IPtr<FNPath> place = adopt(FNPath(text, FPath::kFile).createAbsolutePath(&base));
        EXPECT_EQ(fullPathOf(*place), result) << utf8(text);
    }
    relative.setFileType(FFileType(nullptr, "abc", nullptr, 0, "Alphabet"));
    relative.setPathType(FPath::kLink);
    EXPECT_TRUE(relative.makeAbsolute(&base));
    EXPECT_TRUE(relative.isLink());
    EXPECT_EQ(utf8(relative.getKnownFileType().getName()), "Alphabet");
    EXPECT_FALSE(relative.makeAbsolute(&base)) << "it is by now";
}

TEST(FNPath, FollowsAWayOverManyLevels)
{
    constexpr int kLevels = 100000;
    std::u16string up, down;
    for (int i = 0; i < kLevels; i++)
        up += u"../", down += u"/a";
    const FNPath relative((up + u"b/c").c_str(), FPath::kFile);
    EXPECT_EQ(relative.countAscendLevels(), kLevels);
    for (const auto& [base, result] :
         {std::pair(u"/x/y" + down, "/x/y/b/c"), std::pair(u"/x" + down.substr(4), "/b/c"),
          std::pair(u"x" + down, "x/a/b/c")})
    {
        const FNPath folder(base.c_str(), FPath::kFolder);
        const IPtr<FNPath> place = adopt(relative.createAbsolutePath(&folder));
        EXPECT_EQ(fullPathOf(*place), result);
    }
}

TEST(FNPath, WritesItselfAsAUrl)
{
    FString url;
    EXPECT_TRUE(pathOf("/a b/\xC3\xA4%.wav").createURL(url));
    EXPECT_EQ(utf8(url), "file:///a%20b/%C3%A4%25.wav");
    EXPECT_FALSE(pathOf("a").createURL(url));
}

TEST(FNPath, MakesNamesValid)
{
    FNPath path(u"/x*y?/a*b", FPath::kFile);
    EXPECT_TRUE(path.makeValidName(u'-'));
    EXPECT_EQ(partsOf(path), "/x-y-/|a-b");
    EXPECT_FALSE(path.makeValidName(u'-'));
}

class FNPathStorage : public testing::Test
{
protected:
    void TearDown() override { FNPath::storeAttrFileType = false; }
};

TEST_F(FNPathStorage, AttributesHoldWhatIsSet)
{
    FAttributes attributes;
    FNPath folder(u"/a/b", FPath::kFolder);
    EXPECT_TRUE(folder.storeAttributes(attributes));
    int layout = 0;
    EXPECT_TRUE(attributes.get("PathType", layout));
    EXPECT_EQ(layout, 2);

    FAttributes rootOnly;
    FNPath(u"/", FPath::kFolder).storeAttributes(rootOnly);
    EXPECT_FALSE(rootOnly.containsAttribute("Name"));
    FAttributes nameOnly;
    FNPath(u"a", FPath::kFile).storeAttributes(nameOnly);
    EXPECT_FALSE(nameOnly.containsAttribute("Path") || nameOnly.containsAttribute("Type"));

    FNPath restored(u"/other/x", FPath::kFile);
    EXPECT_TRUE(restored.restoreAttributes(attributes));
    EXPECT_EQ(partsOf(restored), "/a/|b");
    EXPECT_TRUE(restored.isFolder());

    FAttributes empty;
    EXPECT_TRUE(restored.restoreAttributes(empty));
    EXPECT_EQ(partsOf(restored), "|");
    EXPECT_TRUE(restored.isFile());
}

TEST_F(FNPathStorage, OlderLayoutsHadTheOtherDelimiter)
{
    for (const bool isMarked : {true, false})
    {
        FAttributes attributes;
        attributes.set("Name", u"b");
        attributes.set("Path", u"C:\\a");
        if (isMarked)
            attributes.set("PathType", 1);
        FNPath path;
        path.restoreAttributes(attributes);
        EXPECT_EQ(partsOf(path), "C:/a/|b");
    }
}

TEST_F(FNPathStorage, ArchivesTellTheirLayout)
{
    for (const auto& [layout, path, parts] :
         {std::tuple(1, u"C:\\a", "C:/a/|b"), std::tuple(2, u"x\\y/", "x\\y/|b"), std::tuple(3, u"/", "")})
    {
        const IPtr<FMemoryStream> stream = adopt(new FMemoryStream);
        FNewArchive writing(stream, true);
        EXPECT_TRUE(FString(u"b").externalize(writing) && FFileType().externalize(writing) &&
                    stream->writeInt32(layout) && stream->writeInt16(FPath::kFolder) &&
                    FString(path).externalize(writing));
        stream->rewind();
        FNewArchive reading(stream, false);
        FNPath restored;
        ASSERT_EQ(restored.internalize(reading), layout < 3) << layout;
        if (layout == 3)
            continue;
        EXPECT_EQ(partsOf(restored), parts);
        EXPECT_TRUE(restored.isFolder());
    }
}

TEST_F(FNPathStorage, FileTypeIsStoredOnDemand)
{
    FNPath path(u"/a/b.abc", FPath::kFile);
    path.setFileType(FFileType(nullptr, "abc", "abc", 0, "Alphabet"));
    FAttributes without;
    path.storeAttributes(without);
    EXPECT_FALSE(without.containsAttribute("FileType"));

    FNPath::storeAttrFileType = true;
    FAttributes with;
    path.storeAttributes(with);
    FNPath restored;
    restored.restoreAttributes(with);
    EXPECT_EQ(utf8(restored.getKnownFileType().getName()), "Alphabet");
}

TEST_F(FNPathStorage, ArchiveRoundTrip)
{
    const IPtr<FMemoryStream> stream = adopt(new FMemoryStream);
    FNPath path(u"/a/\u00E4.abc", FPath::kLink);
    path.setFileType(FFileType("text/x", "abc", "abcd", fourCharCode("ABCD"), "Alphabet", "org.x"));
    {
        FNewArchive archive(stream, true);
        EXPECT_TRUE(path.externalize(archive));
    }
    stream->rewind();
    FNewArchive archive(stream, false);
    FNPath restored;
    EXPECT_TRUE(restored.internalize(archive));
    EXPECT_EQ(partsOf(restored), partsOf(path));
    EXPECT_TRUE(restored.isLink());
    EXPECT_EQ(restored.getKnownFileType().getMacType(), fourCharCode("ABCD"));
    EXPECT_EQ(utf8(restored.getKnownFileType().getUti()), "org.x");

    stream->setSize(20);
    stream->rewind();
    FNewArchive cut(stream, false);
    EXPECT_FALSE(restored.internalize(cut));
}
} // namespace
