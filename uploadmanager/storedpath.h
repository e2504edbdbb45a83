#pragma once

#include "foundation/object/iptr.h"
#include "storage/path/fnpath.h"

class FAttributes;
class FString;

/// Notes the full path of a file. A path is text as far as its bytes are; one with others would come back changed
/// from a file in UTF-8, so that one is noted as its bytes.
void storePath(FAttributes& attributes, const char* key, const FString& fullPath);

/// The path that is noted; an empty one where there is none.
IPtr<FNPath> restorePath(const FAttributes& attributes, const char* key);
