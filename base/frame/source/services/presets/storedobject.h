#pragma once

#include "foundation/object/iptr.h"

class CmObject;

// Objects of presets whose class this program doesn't know, since a component that brings it is missing: they are kept
// as they were stored, so that saving them again loses nothing.

/// What an attribute tree holds as an object: the object, or its stored form where its class is unknown.
IPtr<CmObject> keepStoredObject(CmObject* stored);

/// The object behind a result of `keepStoredObject`, borrowed. Null while its class is unknown.
CmObject* resolveKeptObject(CmObject* kept);
