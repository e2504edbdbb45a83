#pragma once

#include "containers/sequence/cmarray.h"
#include "fuzz/fuzztext.h"
#include "services/presets/fpresetlist.h"
#include "services/presets/fpresetpool.h"
#include "storage/archive/fxmlarchive.h"
#include "storage/stream/fmemorystream.h"

/// Asks a list, and what is below it, for all that it has; gives the number of presets.
inline int walk(FPresetList& list)
{
    int count = list.countPresets();
    for (int i = 0; i < list.countPresets(); i++)
    {
        require(list.getPresetName(i) && list.getPreset(i)->getOwner() == &list);
        list.getPresetObject(i);
        list.setPresetName(i, u"name");
    }
    for (int i = 0; i < list.countSubLists(); i++)
    {
        require(list.getSubList(i)->getOwner() == &list);
        count += walk(*list.getSubList(i));
    }
    return count;
}

/// What was read can be copied, stored and changed.
inline void use(FPresetList& list)
{
    const int count = walk(list);
    auto copy = adopt(static_cast<FPresetList*>(list.newCopy()));
    require(walk(*copy) == count);
    CmArray objects;
    objects.retainElements();
    require(list.collectPresetObjects(objects) <= count);
    FXmlArchive archive(adopt(new FMemoryStream), true);
    archive.addGlobalRoot("PresetList", &list);
    archive.save("Presets");
    list.removeNonModifyPresets();
    while (list.removePresetAt(0))
    {
    }
    require(list.countPresets() == 0);
}

inline void use(FPresetPool& pool)
{
    for (int i = 0; i < pool.countLists(); i++)
        use(*pool.getListAt(i));
}
