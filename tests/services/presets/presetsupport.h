#pragma once

#include "services/presets/fpresetlist.h"
#include "storage/archive/fxmlarchive.h"
#include "tests/storage/filefixture.h"
#include "tests/storage/objectfixture.h"

#include <string>

/// Notes the changes of which it hears, and those of its own that are done.
class Watched : public CmObject
{
    DECLARE_COPYABLE(Watched, CmObject)

    using CmObject::update;
    void update(CmObject*, int message) override { heard += std::to_string(message) + " "; }
    void updateDone(int message) override { done += std::to_string(message) + " "; }

    std::string heard;
    std::string done;
};

/// The list's presets as "name=number", lists below it as "name(...)".
inline std::string presetsOf(FPresetList& list)
{
    std::string text;
    for (int i = 0; i < list.countPresets(); i++)
    {
        const auto* node = FCast(StoredNode, list.getPresetObject(i));
        text += utf8(list.getPresetName(i)) + "=" + (node ? std::to_string(node->number) : "?") + " ";
    }
    for (int i = 0; i < list.countSubLists(); i++)
        text += utf8(list.getSubList(i)->getName()) + "(" + presetsOf(*list.getSubList(i)) + ") ";
    if (!text.empty())
        text.pop_back();
    return text;
}

inline IPtr<StoredNode> node(int number)
{
    return adopt(new StoredNode(number));
}

/// What an archive makes of the object: its tree, written and read again.
inline IPtr<FAttributes> archived(const CmObject& object)
{
    FAttributes tree;
    EXPECT_TRUE(object.storeAttributes(tree));
    auto stream = adopt(new FMemoryStream);
    EXPECT_TRUE(FXmlArchive(stream, true).saveAttributes("Test", tree));
    stream->rewind();
    auto result = adopt(new FAttributes);
    EXPECT_TRUE(FXmlArchive(stream, false).loadAttributes("Test", *result));
    return result;
}
