#pragma once

#include "foundation/object/types.h"

// The attribute files of the program in the user folder, with their roots and keys. Text values all of them.

/// A product's name gives its token in base64, empty after a logout.
inline constexpr const char16* kTokenFile = u"scat";
inline constexpr const char* kTokenRoot = "scat";

/// Names the description that waits for a login.
inline constexpr const char16* kCacheFile = u"Vellamoor Upload Manager Cache";
inline constexpr const char* kCacheRoot = "VellamoorUploadManagerCache";
inline constexpr const char* kCacheKey = "latest request file";

/// The language of the last description that gave a valid one.
inline constexpr const char16* kLanguageFile = u"language";
inline constexpr const char* kLanguageRoot = "language";
inline constexpr const char* kLanguageKey = "language";
