#pragma once

#include "containers/sequence/cmarray.h"
#include "storage/path/fnpath.h"

class FFilePresetList;
class FPresetList;
class FPresetListOwnFile;

/// All lists of presets of the program.
///
/// Lists in memory are kept in one file together, a list with a file of its own in that, and a list over a folder in its
/// folder. All stand in the folder "Presets" of the user, which begins as a copy of the one that comes with the
/// program. Main thread.
class FPresetPool : public CmObject
{
    DECLARE_CLASS(FPresetPool, CmObject)

    FPresetPool();

    int countLists() const { return lists.total(); }
    /// Borrowed; null out of range.
    FPresetList* getListAt(int index) const;
    /// The first list of this ID, borrowed; null where there is none.
    FPresetList* getPresetList(const char16* id) const;
    /// Adds a reference. False for null and for a list that is in the pool already.
    bool addPresetList(FPresetList* list);
    /// Takes the list out of the pool, with its file if it has one of its own. Of a list over a folder the folder
    /// stays, as in `removeFilePreset`.
    bool removePresetList(FPresetList* list);
    bool removeFilePreset(FFilePresetList* list);
    void removeAll();

    /// Replaces all lists by those of a folder; false, with none, where nothing could be read.
    bool load(const FNPath& folder);
    /// Writes the lists to a folder, which is made where it is missing. A file there that couldn't be read is put
    /// aside first. False where not everything could be written.
    bool save(const FNPath& folder);
    /// Reads the older file "Presets2.bin" of the application folder.
    bool loadOlderFile();

    /// Functions that run when the pool is loaded, in order of registration.
    static void addPostLoadFunc(void (*function)());
    static void callPostLoadFuncs();

    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;

private:
    int countMemoryLists() const;
    bool loadMemoryLists(const FNPath& folder);
    void loadOwnFile(const FNPath& path);
    bool saveMemoryLists(const FNPath& folder);
    static bool saveOwnFile(const FNPath& folder, FPresetListOwnFile& list);

    CmArray lists;
    /// The file from which the lists in memory came, or to which they went last.
    FNPath memoryFile;
};

/// The one pool; null before the settings were loaded and after the program's end.
extern FPresetPool* gPresetPool;

// With the user's settings: loads the pool when those were loaded, saves it before they are saved.
void PostDefLoadFPresetPool();
void PreDefSaveFPresetPool();
