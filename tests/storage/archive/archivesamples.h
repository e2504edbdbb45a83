#pragma once

#include "storage/attribute/fxmlobject.h"
#include "tests/storage/objectfixture.h"

/// A tree with every kind of value, and an object that stands at several places.
inline IPtr<FAttributes> makeSampleTree()
{
    auto tree = adopt(new FAttributes);
    auto node = adopt(new StoredNode(5, adopt(new StoredNode(6))));
    auto sub = adopt(new FAttributes);
    tree->set("i", -1);
    tree->set("f", 0.1);
    tree->set("s", "nar\xE9$");
    tree->set("w", u"weit ä <&>");
    tree->set("e", u"");
    tree->setObject("n", node);
    tree->setBinary("b", "\0xyz\xFF", 5);
    tree->setAttributes("sub", sub);
    sub->set("deep", 1LL << 62);
    sub->setObject("same", node);
    tree->queueInt("qi", -1);
    tree->queueInt("qi", 7);
    tree->queueFloat("qf", 2.5);
    tree->queueString16("qs", u"ö");
    tree->queueObject("qo", node);
    tree->queueObject("qo", adopt(new StoredNode(8)));
    auto item = adopt(new FAttributes);
    item->set("x", 3);
    tree->queueAttributes("qa", item);
    return tree;
}

/// What a tree that was read holds of the sample. Placeholders are made.
inline std::string describeSample(const FAttributes& tree)
{
    std::string text;
    const auto note = [&](bool isThere, const char* name) { text += isThere ? name : ""; };
    FString wide;
    long long number = 0;
    note(tree.getInt("i") == -1 && tree.getFloat("f") == 0.1, "numbers ");
    const char* narrow = tree.getString8("s");
    note(narrow && std::string(narrow) == "nar\xE9$", "narrow ");
    note(tree.get("w", wide) && wide.isWideString() && wide == ConstString(u"weit ä <&>"), "wide ");
    note(tree.get("e", wide) && wide.isWideString() && wide.isEmpty(), "empty ");
    std::string block(5, '-');
    note(tree.getBinarySize("b") == 5 && tree.getBinary("b", block.data(), 5) &&
             block == std::string("\0xyz\xFF", 5),
         "block ");
    auto* node = FCast(StoredNode, tree.getObject("n", "StoredNode"));
    note(node && node->number == 5 && node->nextNode() && node->nextNode()->number == 6, "object ");
    const FAttributes* sub = tree.getAttributes("sub");
    note(sub && sub->getInt("deep") == 1LL << 62, "sub ");
    note(sub && node && sub->getObject("same", nullptr) == node, "shared ");
    note(tree.unqueueInt("qi", number) && number == -1 && tree.unqueueInt("qi", number) && number == 7,
         "ints ");
    double real = 0;
    note(tree.unqueueFloat("qf", real) && real == 2.5, "floats ");
    note(tree.unqueueString("qs", wide) && wide == ConstString(u"ö"), "texts ");
    auto first = adopt(tree.unqueueObject("qo", "StoredNode"));
    auto second = adopt(FCast(StoredNode, tree.unqueueObject("qo", "StoredNode")));
    note(first.get() == node && second && second->number == 8, "objects ");
    const FAttributes* item = tree.unqueueAttributes("qa");
    note(item && item->getInt("x") == 3, "trees");
    tree.resetAllQueues();
    return text;
}

inline constexpr const char* kWholeSample =
    "numbers narrow wide empty block object sub shared ints floats texts objects trees";
