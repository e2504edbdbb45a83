#pragma once

#include "foundation/object/iptr.h"
#include "foundation/text/fstring.h"

#include <vector>

class FPath;

/// Paths inside an archive or a mounted folder, which lead nowhere else. Thread-safe.
namespace InnerPath
{
/// The components of a path from the root. Both delimiters count; "." and empty components are left out, and ".."
/// takes back the one before. False where the path leads above the root.
///
/// | path           | components | result |
/// |----------------|------------|--------|
/// | "/a/b"         | a, b       | true   |
/// | "a/./x/..\b/"  | a, b       | true   |
/// | ""             |            | true   |
/// | "a/../.."      |            | false  |
bool split(const FPath& path, std::vector<FString>& components);
/// The full path as a text.
FString textOf(const FPath& path);
/// The components as a text that begins with a delimiter; that alone for none.
FString join(const std::vector<FString>& components);
/// A child of a folder, of the folder's own kind of path.
IPtr<FPath> childOf(const FPath& folder, const FString& name, int type);
/// What `getDirName` gives for an inner path: a folder itself, and what a file is in.
bool getDirName(const FPath& path, FString& result);
} // namespace InnerPath
