#pragma once

#include "storage/stream/ffiletype.h"

/// File types that everybody knows, registered by their first use at the latest.
namespace StdFileType
{
FFileType& getTextFileType();
}
