#include "tests/storage/filefixture.h"

namespace
{
using FNPathFilesTest = FileTest;

TEST_F(FNPathFilesTest, NumbersNamesThatAreTaken)
{
    const auto unique = [this](const std::string& name)
    {
        const IPtr<FNPath> path = at(name);
        EXPECT_TRUE(path->uniqueName());
        return utf8(path->getName());
    };
    EXPECT_EQ(unique("take.wav"), "take.wav");
    put("take.wav", "");
    EXPECT_EQ(unique("take.wav"), "take-01.wav");
    put("take-01.wav", "");
    std::filesystem::create_directory(root + "/take-02.wav");
    EXPECT_EQ(unique("take.wav"), "take-03.wav") << "a folder takes a name too";
    put("take-09.wav", "");
    EXPECT_EQ(unique("take-09.wav"), "take-10.wav") << "the count goes on";
    put("take-99", "");
    EXPECT_EQ(unique("take-99"), "take-100");
    put("-07.wav", "");
    EXPECT_EQ(unique("-07.wav"), "file-08.wav");
    put("a-99999999999999999999", "");
    EXPECT_EQ(unique("a-99999999999999999999"), "a-99999999999999999999-01");
    put("last-9999", "");
    const IPtr<FNPath> last = at("last-9999");
    EXPECT_FALSE(last->uniqueName());
    EXPECT_EQ(utf8(last->getName()), "last-9999");

    const IPtr<FNPath> plain = at("take.wav");
    EXPECT_TRUE(plain->makeUnique(*files));
    EXPECT_EQ(utf8(plain->getName()), "take-02.wav") << "only files count for a file system in general";
}

TEST_F(FNPathFilesTest, StandardFoldersAreMadeOnDemand)
{
    FNPath path(u"name", FPath::kFile);
    EXPECT_FALSE(path.getStandardFolder(FNPath::kUserFolder, nullptr, false));
    EXPECT_EQ(fullPathOf(path), root + "/config/user/name") << "where it would be";
    EXPECT_TRUE(path.getStandardFolder(FNPath::kUserFolder, u"sub/deep", true));
    EXPECT_EQ(fullPathOf(path), root + "/config/user/sub/deep/name");
    EXPECT_TRUE(exists("config/user/sub/deep"));
    EXPECT_TRUE(path.getStandardFolder(FNPath::kUserFolder, u"sub", false));
    EXPECT_FALSE(path.getStandardFolder(FNPath::kUserFolder, u"none", false));

    const std::string before = fullPathOf(path);
    EXPECT_FALSE(path.getStandardFolder(9, nullptr, true));
    EXPECT_FALSE(path.getStandardFolder(FNPath::kSystemFolder, nullptr, true)) << "nobody knows it";
    EXPECT_EQ(fullPathOf(path), before);

    const FNPath made(u"settings", FNPath::kTempFolder, FPath::kFile, u"mine", true);
    EXPECT_EQ(fullPathOf(made), root + "/temp/mine/settings");
    EXPECT_EQ(fullPathOf(FNPath(u"settings", FNPath::kSystemFolder, FPath::kFile, nullptr, true)), "")
        << "never a file of that name in the folder of the process";
    const IPtr<FNPath> user = adopt(createUserFolderPath());
    EXPECT_EQ(fullPathOf(*user), root + "/config/user");
    EXPECT_TRUE(user->isFolder());

    IStandardFolders::setInstance(nullptr);
    EXPECT_FALSE(path.getStandardFolder(FNPath::kUserFolder, nullptr, true));
    EXPECT_EQ(createUserFolderPath(), nullptr);
}

FFileType oggType(nullptr, "testogg", "testogg", 0, "Ogg File");

FFileType* identifyOgg(unsigned char* header, int length)
{
    return length >= 4 && memcmp(header, "OggS", 4) == 0 ? &oggType : nullptr;
}

TEST_F(FNPathFilesTest, TypesComeFromExtensionOrContent)
{
    FFileType::registerTypeIdentifier(identifyOgg);
    put("sound.xyz", "OggS....");
    put("sound", "OggS....");
    put("empty", "");

    const IPtr<FNPath> byContent = at("sound.xyz");
    EXPECT_FALSE(byContent->detectFileType(false));
    EXPECT_EQ(utf8(byContent->getKnownFileType().getDosType()), "xyz");
    EXPECT_EQ(utf8(byContent->getFileType().getUnixType()), "xyz")
        << "a type that is known isn't detected again";
    EXPECT_TRUE(byContent->detectFileType(true));
    EXPECT_EQ(utf8(byContent->getKnownFileType().getName()), "Ogg File");
    EXPECT_EQ(utf8(at("sound")->getFileType().getName()), "Ogg File");
    EXPECT_EQ(utf8(at("empty")->getFileType().getDosType()), "???");
    EXPECT_EQ(utf8(at("missing.txt")->getFileType().getName()), "Text File");
    EXPECT_EQ(utf8(at("x", FPath::kFolder)->getFileType().getName()), "directory");
    EXPECT_FALSE(at("x", FPath::kFolder)->getFileType().isValid());
}

TEST_F(FNPathFilesTest, DetectionAsksTheDisk)
{
    std::filesystem::create_directory(root + "/tool.app");
    const IPtr<FNPath> bundle = at("tool.app");
    bundle->detectFileType(false);
    EXPECT_TRUE(bundle->isBundle() && bundle->isFolder());
    put("file.app", "x");
    const IPtr<FNPath> file = at("file.app");
    EXPECT_EQ(file->getPlatformState(), -1);
    file->detectFileType(false);
    EXPECT_TRUE(file->isFile());
    EXPECT_NE(file->getPlatformState(), -1);
    const IPtr<FNPath> hidden = at(".profile");
    EXPECT_TRUE(hidden->isVisible());
    hidden->detectFileType(false);
    EXPECT_FALSE(hidden->isVisible());
}

TEST_F(FNPathFilesTest, TypesAreVerified)
{
    put("a.txt", "x");
    EXPECT_TRUE(files->verifyType(at("a.txt"), FFileType("text/plain", nullptr, nullptr, 0, nullptr)));
    EXPECT_FALSE(files->verifyType(at("a.txt"), FFileType("text/html", nullptr, nullptr, 0, nullptr)));
    EXPECT_FALSE(files->verifyType(at("missing.txt"), FFileType("text/plain", nullptr, nullptr, 0, nullptr)));
}
} // namespace
