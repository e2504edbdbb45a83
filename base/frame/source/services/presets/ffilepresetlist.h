#pragma once

#include "services/presets/fpresetlist.h"
#include "storage/path/fnpath.h"

class FFilePreset;

/// A list of presets over a folder: each preset is a file, each list below it a folder.
///
/// The folder is looked through when the list is first asked for something, and a file is read when its object or its
/// flags are asked for: a folder of thousands opens at once. Presets stand in the natural order of their names, new
/// ones at the end. A file that can't be read gives a null object, and counts as one that may be modified. Changes of
/// the folder by others are not seen. Main thread.
class FFilePresetList : public FPresetList
{
    DECLARE_COPYABLE(FFilePresetList, FPresetList)

    /// The folder's name is the list's name and ID.
    explicit FFilePresetList(const FNPath& itsFolder);
    /// The copy looks through the folder by itself.
    FFilePresetList(const FFilePresetList& other);

    const FNPath& getFolder() const { return folder; }
    /// Drops the objects that were read, in this list and those below it.
    void unuse();

    CmObject* getPresetObject(int index) override;
    /// Renames the file. The name is made valid for the disk; false, with all as it was, where it is taken.
    bool setPresetName(int index, const char16* presetName) override;
    bool canModifiyPreset(int index) override;
    bool presetRenamed(int index) override;
    /// Writes the file anew. False, with all as it was, where that fails.
    bool resetRenameState(int index) override;
    /// Writes a new file. The name is made valid, and numbered where it is taken.
    int addPreset(CmObject* object, const char16* presetName, bool mayBeModified = true,
                  bool isRenamed = true) override;
    /// Removes the file; false, with the preset still there, where that fails.
    bool removePresetAt(int index) override;
    /// Makes a folder.
    FPresetList* addSubList(const char16* listName) override;

    // Always false: the folder is what is stored.
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;

protected:
    void prepare() override;

private:
    FFilePreset* filePreset(int index);
    FFilePreset* readPreset(int index);

    FNPath folder;
    bool isPrepared = false;
};
