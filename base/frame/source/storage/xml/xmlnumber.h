#pragma once

#include "foundation/object/types.h"

class Buffer;

namespace Xml
{
/// Append a number as files hold it: "%lld", "%llu", and "%.50g", which brings back any double as it was.
void appendInt(Buffer& out, int64 value);
void appendUInt(Buffer& out, uint64 value);
void appendFloat(Buffer& out, double value);
} // namespace Xml
