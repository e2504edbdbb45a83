#pragma once

#include "services/presets/fpresetlist.h"
#include "storage/path/fnpath.h"

/// A list of presets that the pool keeps in a file of its own, apart from the others in memory. Main thread.
class FPresetListOwnFile : public FPresetList
{
    DECLARE_CLASS(FPresetListOwnFile, FPresetList)

    using FPresetList::FPresetList;
    FPresetListOwnFile() = default;
    /// The copy has no file yet, here and in the next one.
    FPresetListOwnFile(const FPresetListOwnFile& other) : FPresetList(other) {}
    explicit FPresetListOwnFile(const FPresetList& other) : FPresetList(other) {}

    /// From where the list came, or to where it went last; empty before.
    const FNPath& getFile() const { return file; }
    void setFile(const FNPath& path) { file = path; }

private:
    FNPath file;
};
