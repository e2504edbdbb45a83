#include "storage/attribute/fcmobjectstripper.h"
#include "storage/attribute/fobjectlist.h"
#include "tests/storage/objectfixture.h"

#include <gtest/gtest.h>

#include <vector>

namespace
{
/// Objects that live before and after must be as many: placeholders and objects may not keep one another.
class Stripper : public testing::Test
{
protected:
    void TearDown() override { EXPECT_EQ(StoredNode::alive, before); }

    int before = StoredNode::alive;
};
} // namespace

TEST_F(Stripper, ReplacesObjectsByWhatTheyStoreAndSharesThem)
{
    FAttributes tree;
    {
        auto node = adopt(new StoredNode(3));
        auto sub = adopt(new FAttributes);
        tree.setObject("a", node);
        tree.setAttributes("sub", sub);
        sub->setObject("b", node);
        tree.queueObject("q", node);
        tree.stripObjects();
    }
    EXPECT_EQ(StoredNode::alive, before) << "no live object is left";
    const auto* instance = FCast(FXmlInstance, tree.entryAt(0)->getObj());
    ASSERT_TRUE(instance);
    EXPECT_STREQ(instance->getClassName(), "StoredNode");
    EXPECT_TRUE(FCast(FXmlReference, tree.getAttributes("sub")->entryAt(0)->getObj()));
    EXPECT_EQ(tree.getObjectAttributes("a")->getInt("Number"), 3);

    auto* made = FCast(StoredNode, tree.getObject("a", "StoredNode"));
    ASSERT_TRUE(made);
    EXPECT_EQ(made->number, 3);
    EXPECT_EQ(tree.getAttributes("sub")->getObject("b", "StoredNode"), made);
    EXPECT_EQ(adopt(tree.unqueueObject("q", "StoredNode")).get(), made);
    EXPECT_EQ(tree.getObjectAttributes("a"), nullptr) << "its tree was released when it was made";
}

TEST_F(Stripper, DropsWhatCannotBeStored)
{
    FAttributes tree;
    auto node = adopt(new StoredNode(3));
    node->refusesToStore = true;
    tree.setObject("a", node);
    tree.queueObject("q", node);
    tree.queueObject("q", new StoredNode(4), true);
    tree.set("n", 1);
    tree.stripObjects();
    EXPECT_FALSE(tree.containsAttribute("a"));
    EXPECT_EQ(tree.countQueueItems("q"), 1);
    EXPECT_EQ(tree.getInt("n"), 1);
}

TEST_F(Stripper, CirclesAreMadeAgainAndNeverLeak)
{
    FAttributes unused, used;
    {
        auto first = adopt(new StoredNode(1));
        auto second = adopt(new StoredNode(2, first));
        first->next = second;
        unused.setObject("first", first);
        unused.stripObjects();
        used = unused;
        first->next = nullptr;
    }
    auto* first = FCast(StoredNode, used.getObject("first", "StoredNode"));
    ASSERT_TRUE(first && first->nextNode());
    EXPECT_EQ(first->nextNode()->number, 2);
    EXPECT_EQ(first->nextNode()->nextNode(), first);
    first->nextNode()->next = nullptr;
}

TEST_F(Stripper, ObjectsThatWereMadeOfPlaceholdersAreStrippedAnew)
{
    FAttributes tree;
    {
        auto second = adopt(new StoredNode(2));
        tree.setObject("a", adopt(new StoredNode(1, second)));
        tree.entry("b").setUnknown(static_cast<FUnknown*>(second.get()), FAttributeValue::kBorrowed);
        tree.queueObject("q", second);
    }
    tree.stripObjects();
    auto* made = FCast(StoredNode, tree.getObject("b", "StoredNode"));
    ASSERT_TRUE(made);
    made->number = 5;
    tree.stripObjects();
    EXPECT_EQ(StoredNode::alive, before) << "neither at its places nor behind the placeholder of another";

    auto* first = FCast(StoredNode, tree.getObject("a", "StoredNode"));
    ASSERT_TRUE(first && first->nextNode());
    EXPECT_EQ(first->nextNode()->number, 5);
    EXPECT_EQ(tree.getObject("b", nullptr), first->nextNode());
    EXPECT_EQ(adopt(tree.unqueueObject("q", nullptr)).get(), first->nextNode());
}

TEST_F(Stripper, LongChainsDoNotExhaustTheStack)
{
    constexpr int length = 50000;
    FAttributes tree;
    std::vector<IPtr<StoredNode>> chain;
    for (int i = 0; i < length; i++)
        chain.push_back(adopt(new StoredNode(i, i ? chain.back().get() : nullptr)));
    tree.setObject("last", chain.back());
    tree.stripObjects();
    for (auto& node : chain)
        node->next = nullptr;
    chain.clear();
    EXPECT_EQ(tree.getObjectAttributes("last")->getInt("Number"), length - 1);
    tree.removeAll();
}

TEST_F(Stripper, WhatFailsToBeMadeIsNotTriedAgain)
{
    auto stored = adopt(new FAttributes);
    FAttributes tree;
    tree.setObject("unknown", new FXmlInstance(1, "NoSuchClass", stored), true);
    tree.setObject("failing", new FXmlInstance(2, "StoredNode", stored), true);
    EXPECT_EQ(tree.getObject("unknown", nullptr), nullptr);
    EXPECT_EQ(tree.getObject("failing", "CmString"), nullptr) << "another class: not even tried";
    EXPECT_EQ(tree.getObjectAttributes("failing"), stored.get());
    EXPECT_EQ(tree.getObject("failing", "StoredNode"), nullptr);
    stored->set("Number", 1);
    EXPECT_EQ(tree.getObject("failing", "StoredNode"), nullptr);
    EXPECT_EQ(stored->getRefCount(), 1u);
}

TEST(FXmlReference, ThoseThatDoNotCountAreEmptyWhenTheirTargetGoes)
{
    auto target = adopt(new FXmlInstance(1, "StoredNode", nullptr));
    std::vector<IPtr<FXmlReference>> references;
    for (int i = 0; i < 5; i++)
    {
        references.push_back(adopt(new FXmlReference(1)));
        references.back()->setTarget(target, false);
    }
    EXPECT_EQ(target->getRefCount(), 1u);
    references.erase(references.begin() + 1);
    references.pop_back();
    references.front()->setTarget(nullptr, false);
    EXPECT_EQ(references.back()->getTarget(), target.get());
    target = nullptr;
    for (const auto& reference : references)
        EXPECT_EQ(reference->getTarget(), nullptr);
}
