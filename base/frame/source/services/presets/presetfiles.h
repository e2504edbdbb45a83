#pragma once

#include "foundation/object/iptr.h"
#include "storage/path/fnpath.h"

class FXmlArchive;

// The files of presets: XML archives with the root tag "Presets", each of which holds one root.
//
// | file                         | root                   |
// |------------------------------|------------------------|
// | Presets/RAMPresets.xml       | "Pool", global         |
// | Presets/<list>.xml           | "PresetList", global   |
// | Presets/<folder>/<name>.pxml | "Preset", in its place |

namespace PresetFiles
{
inline constexpr const char* kRootTag = "Presets";
inline constexpr const char* kPoolRoot = "Pool";
inline constexpr const char* kListRoot = "PresetList";
inline constexpr const char* kPresetRoot = "Preset";

inline constexpr const char* kPresetExtension = "pxml";
inline constexpr const char* kArchiveExtension = "xml";

/// The type of a file with one preset.
const FFileType& presetType();

/// Writes beside the file and puts the whole over what is there; false leaves the earlier file as it was.
bool writeGlobalRoot(const FNPath& path, const char* rootName, CmObject* object);
bool writeRoot(const FNPath& path, const char* rootName, CmObject* object);

/// Null where the file can't be read or holds no such object.
IPtr<CmObject> readGlobalRoot(const FNPath& path, const char* rootName, const char* className);
/// Restores `object` from the root of the file.
bool readRoot(const FNPath& path, const char* rootName, CmObject* object);

/// A text as a name that the disk takes: that of a folder, or of a file with this extension.
FString validName(const char16* text);
FString fileName(const char16* text, const char* extension);
} // namespace PresetFiles
