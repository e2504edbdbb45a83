#include "services/defaults/fdefaultpool.h"
#include "services/defaults/fdefaultsbypass.h"
#include "services/defaults/fplugdefaults.h"
#include "storage/archive/fxmlarchive.h"
#include "tests/storage/filefixture.h"
#include "tests/storage/objectfixture.h"

namespace
{
const char* const kFile = "config/user/Defaults.xml";

class Defaults : public FileTest
{
protected:
    /// The pool as a next start of the program has it.
    static IPtr<FDefaultPool> reload()
    {
        auto pool = adopt(new FDefaultPool);
        pool->load();
        return pool;
    }

    IPtr<FDefaultPool> pool = adopt(new FDefaultPool);
};
} // namespace

TEST_F(Defaults, AnotherVersionDiscardsTheGroup)
{
    FDefaults* group = pool->getDefaults("a", 1, true);
    ASSERT_TRUE(group);
    group->setLong("k", 5);
    EXPECT_EQ(pool->getDefaults("a", 1, false), group);
    FDefaults* next = pool->getDefaults("a", 2, true);
    ASSERT_TRUE(next);
    EXPECT_TRUE(next->isEmpty());
    EXPECT_FALSE(pool->removeDefaults("a", 1)) << "of another version";
    EXPECT_EQ(pool->getDefaults("a", 3, false), nullptr);
    EXPECT_EQ(pool->getDefaults("a", 2, false), nullptr) << "looking for a version discards another";
    EXPECT_EQ(pool->getDefaults("", 0, true), nullptr);
    EXPECT_EQ(pool->getDefaults(nullptr, 0, true), nullptr);
    pool->getDefaults("b", 0, true);
    EXPECT_TRUE(pool->removeDefaults("b", 0));
    pool->terminate();
    EXPECT_EQ(pool->getDefaults("c", 0, true), nullptr);
}

TEST_F(Defaults, InitNeverOverwrites)
{
    FDefaults group("g", 0);
    group.setLong("k", 7);
    group.initLong("k", 5);
    EXPECT_EQ(group.getLong("k"), 7);
    group.initLongLong("ll", 1LL << 40);
    group.initDouble("d", 0.5);
    group.initString("s", ConstString(u"ä"));
    group.initString8("s8", "b");
    group.initString16("s16", u"c");
    group.initString8("s", "other");
    EXPECT_EQ(group.getLongLong("ll"), 1LL << 40);
    EXPECT_EQ(group.getDouble("d"), 0.5);
    FString text;
    EXPECT_TRUE(group.getString("s", text));
    EXPECT_EQ(text, ConstString(u"ä"));
    EXPECT_STREQ(group.getString8("s8"), "b");
    EXPECT_EQ(ConstString(group.getString16("s16")), ConstString(u"c"));
    int32 untouched = 3;
    EXPECT_FALSE(group.getLong("missing", untouched));
    EXPECT_EQ(untouched, 3);
    EXPECT_EQ(group.getLong("missing"), 0);
    EXPECT_EQ(group.getString8("missing"), nullptr);
    EXPECT_TRUE(group.removeEntry("k"));
    EXPECT_FALSE(group.containsEntry("k"));
}

TEST_F(Defaults, NothingIsSavedBeforeAllHaveRegistered)
{
    pool->setLong("g", "k", 1);
    EXPECT_FALSE(pool->save(false));
    EXPECT_FALSE(exists(kFile));
    pool->postInit();
    EXPECT_TRUE(pool->save(false));
    EXPECT_TRUE(exists(kFile));
}

TEST_F(Defaults, GroupsComeBackSortedAndWithoutTheEmptyOnes)
{
    pool->postInit();
    pool->setLong("second", "long", -5);
    pool->getDefaults("empty", 0, true);
    pool->setLongLong("first", "longlong", 1LL << 40);
    pool->setDouble("first", "double", 0.1);
    pool->setString8("first", "8", "narrow");
    pool->setString16("first", "16", u"weit ä");
    pool->setTString("first", "t", ConstString(u"ö"));
    pool->setObj("versioned", "object", adopt(new StoredNode(7)), 4);
    EXPECT_TRUE(pool->save(false));
    EXPECT_EQ(contentOf(kFile).find("empty"), std::string::npos);
    EXPECT_LT(contentOf(kFile).find("\"first\""), contentOf(kFile).find("\"second\""));
    EXPECT_EQ(rightsOf(kFile), 0600);

    const auto next = reload();
    int32 number = 0;
    int64 big = 0;
    double real = 0;
    FString text;
    EXPECT_TRUE(next->getLong("second", "long", number) && number == -5);
    EXPECT_TRUE(next->getLongLong("first", "longlong", big) && big == 1LL << 40);
    EXPECT_TRUE(next->getDouble("first", "double", real) && real == 0.1);
    EXPECT_STREQ(next->getString8("first", "8"), "narrow");
    EXPECT_EQ(ConstString(next->getString16("first", "16")), ConstString(u"weit ä"));
    EXPECT_TRUE(next->getTString("first", "t", text) && text == ConstString(u"ö"));
    auto* object = FCast(StoredNode, next->getObj("versioned", "object", "StoredNode", 4));
    ASSERT_TRUE(object);
    EXPECT_EQ(object->number, 7);
    EXPECT_FALSE(next->getLong("missing", "long", number));
    EXPECT_EQ(next->getString8("missing", "8"), nullptr);
    EXPECT_EQ(next->getObject("first", "missing"), nullptr);
}

TEST_F(Defaults, WritesTheTreeOfTheFile)
{
    pool->postInit();
    pool->setLong("g", "k", 1);
    EXPECT_TRUE(pool->save(false));
    EXPECT_EQ(contentOf(kFile), "<?xml version=\"1.0\" encoding=\"utf-8\"?>\r<Defaults>\r   <rootObjects>\r"
                                "      <root name=\"Defaults\">\r"
                                "         <list name=\"Entries\" type=\"list\">\r            <item>\r"
                                "               <string name=\"Group\" value=\"g\"/>\r"
                                "               <member name=\"Values\">\r"
                                "                  <int name=\"k\" value=\"1\"/>\r               </member>\r"
                                "               <int name=\"Version\" value=\"0\"/>\r            </item>\r"
                                "         </list>\r      </root>\r   </rootObjects>\r</Defaults>\r");
}

TEST_F(Defaults, ADamagedFileLeavesThePoolEmpty)
{
    pool->postInit();
    pool->setLong("g", "k", 1);
    pool->save(false);
    const std::string whole = contentOf(kFile);
    for (size_t i = 0; i + 1 < whole.size(); i++)
    {
        put(kFile, whole.substr(0, i));
        ASSERT_EQ(reload()->getDefaults("g", 0, false), nullptr) << "cut at " << i;
    }
}

TEST_F(Defaults, AFileThatCannotBeReadIsLeftAlone)
{
    std::filesystem::create_directories(std::filesystem::path(root + "/" + kFile).parent_path());
    // Opens as a file, and gives an error instead of its first byte.
    std::filesystem::create_symlink("/proc/self/mem", root + "/" + kFile);
    const IPtr<FDefaultPool> next = reload();
    next->postInit();
    next->setLong("g", "k", 1);
    EXPECT_TRUE(next->save(false));
    EXPECT_TRUE(std::filesystem::is_symlink(root + "/" + kFile));
}

TEST_F(Defaults, AutoSaversAreServedWhenAllHaveRegistered)
{
    auto saver = adopt(new StoredNode(9));
    pool->addGlobalAutoSaver(saver);
    EXPECT_EQ(saver->getRefCount(), 2u);
    pool->postInit();
    pool->save(false);
    saver->number = 1;
    const auto next = reload();
    next->addGlobalAutoSaver(saver);
    EXPECT_EQ(saver->number, 1);
    next->postInit();
    EXPECT_EQ(saver->number, 9);

    saver->refusesToStore = true;
    next->save(false);
    EXPECT_EQ(contentOf(kFile).find("StoredNode"), std::string::npos) << "who can't store itself is left out";
    EXPECT_NE(contentOf(kFile).find("AutoSavers"), std::string::npos);
}

TEST_F(Defaults, FunctionsRunInTheirOrder)
{
    static std::string calls;
    FDefaultPool::addPreSaveFunc([] { calls += "s1 "; });
    FDefaultPool::addPreSaveFunc([] { calls += "s2 "; });
    FDefaultPool::addPostLoadFunc([] { calls += "l1 "; });
    FDefaultPool::addPostLoadFunc([] { calls += "l2 "; });
    pool->save(true);
    EXPECT_EQ(calls, "") << "nothing is saved yet";
    pool->postInit();
    pool->save(true);
    pool->save(false);
    EXPECT_EQ(calls, "l1 l2 s1 s2 ");
}

TEST_F(Defaults, ComponentsReachThePoolByItsInterfaces)
{
    auto view = adopt(askInterface<IDefaultPool3>(static_cast<CmObject*>(pool.get())));
    ASSERT_TRUE(view);
    auto node = adopt(new StoredNode(3));
    EXPECT_TRUE(view->setObject("g", "k", node));
    EXPECT_EQ(view->getObject("g", "k"), static_cast<FUnknown*>(node));
    EXPECT_FALSE(view->setLong("", "k", 1));
    EXPECT_TRUE(adopt(askInterface<IDefaultPool>(static_cast<CmObject*>(pool.get()))));
    EXPECT_TRUE(adopt(askInterface<IDefaultPool2>(static_cast<CmObject*>(pool.get()))));
}

TEST_F(Defaults, PlugInsHaveFilesOfTheirOwn)
{
    auto plug = adopt(new FPlugDefaults);
    EXPECT_FALSE(plug->load(u"Plug", "PlugRoot"));
    plug->setLong("g", "k", 4);
    EXPECT_TRUE(plug->save(u"Plug", "PlugRoot"));
    EXPECT_TRUE(exists("config/user/Plug.xml"));
    auto next = adopt(new FPlugDefaults);
    EXPECT_TRUE(next->load(u"Plug", "PlugRoot"));
    int32 number = 0;
    EXPECT_TRUE(next->getLong("g", "k", number));
    EXPECT_EQ(number, 4);
}

TEST_F(Defaults, TheBypassLeavesTheFileAlone)
{
    pool->postInit();
    pool->setLong("g", "k", 1);
    pool->save(false);
    FDefaultsBypass::instance().set(true);
    EXPECT_EQ(reload()->getDefaults("g", 0, false), nullptr);
    pool->setLong("g", "k", 2);
    pool->save(false);
    FDefaultsBypass::instance().set(false);
    int32 number = 0;
    EXPECT_TRUE(reload()->getLong("g", "k", number));
    EXPECT_EQ(number, 1);
}
