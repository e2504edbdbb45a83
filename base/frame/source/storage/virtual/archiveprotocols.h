#pragma once

#include "foundation/object/types.h"

// The first words of paths into archives: "archive://name/folder/file".

inline constexpr const char16* kVFSProtocolPlusColon = u"vfs:";         ///< a virtual file system by name
inline constexpr const char16* kArchiveProtocolPlusColon = u"archive:"; ///< an archive by name
inline constexpr const char16* kQZRProtocolPlusColon = u"qzr:";         ///< a resource file
/// Formats of sounds that components bring along.
inline constexpr const char16* kTonerackProtocolPlusColon = u"tonerack:";
inline constexpr const char16* kTonepackProtocolPlusColon = u"tonepack:";

inline constexpr const char16* kPROTOCOL_POSTFIX = u"://";
