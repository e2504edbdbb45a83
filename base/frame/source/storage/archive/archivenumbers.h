#pragma once

#include "foundation/object/types.h"

// The numbers of an XML archive. False for null and for a text that doesn't begin with a number.

bool parseArchiveInteger(const char* text, long long& value);
bool parseArchiveFloat(const char* text, double& value);
/// The number of an object: decimal digits and nothing else.
bool parseArchiveID(const char* text, uint64& id);
