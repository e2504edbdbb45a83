#pragma once

#include "foundation/object/cmobject.h"

/// What CmArray and CmOrderedArray do with their places: `objects` has `size` of them, `total` are in use.
namespace ObjectPlaces
{
/// Sets the number of places. False for a negative one or without memory.
bool resize(CmObject**& objects, int32& size, int newSize);
/// Grows a full array by its step: 0 never, -1 doubles, any other is added. Whether there is a free place.
bool makeRoom(CmObject**& objects, int32& size, int total, int delta);
/// There must be a free place.
void insert(CmObject** objects, int32& total, int index, CmObject* object);
/// Takes out an element, clears the vacated place, and gives the element.
CmObject* take(CmObject** objects, int32& total, int index);
int indexAbs(CmObject* const* objects, int total, const CmObject* object);
/// A place of rank equal to `object` between `low` and `high`, else the one where it belongs.
int bisect(CmObject* const* objects, const CmObject* object, int low, int high);
/// From `place` on, the first one behind what sorts before or with `object`.
int behindEqual(CmObject* const* objects, int total, const CmObject* object, int place);
void sort(CmObject** objects, int total);
} // namespace ObjectPlaces
