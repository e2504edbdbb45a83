#include "containers/sequence/objectplaces.h"

#include <algorithm>
#include <climits>
#include <cstdlib>
#include <cstring>

namespace
{
bool cmpObjs(const CmObject* left, const CmObject* right)
{
    return left->compare(right) < 0;
}

void move(CmObject** to, CmObject* const* from, int count)
{
    memmove(to, from, static_cast<size_t>(count) * sizeof *to);
}
} // namespace

bool ObjectPlaces::resize(CmObject**& objects, int32& size, int newSize)
{
    if (newSize < 0)
        return false;
    if (newSize == 0)
    {
        free(objects);
        objects = nullptr;
        size = 0;
        return true;
    }
    void* places = realloc(static_cast<void*>(objects), static_cast<size_t>(newSize) * sizeof *objects);
    if (!places)
        return false;
    objects = static_cast<CmObject**>(places);
    for (; size < newSize; size++)
        objects[size] = nullptr;
    size = newSize;
    return true;
}

bool ObjectPlaces::makeRoom(CmObject**& objects, int32& size, int total, int delta)
{
    if (total < size)
        return true;
    if (delta == 0)
        return false;
    int64 newSize = int64{size} + delta;
    if (delta == -1)
        newSize = size == 0 ? 10 : int64{size} * 2;
    return newSize > total && newSize <= INT_MAX && resize(objects, size, static_cast<int>(newSize));
}

void ObjectPlaces::insert(CmObject** objects, int32& total, int index, CmObject* object)
{
    move(objects + index + 1, objects + index, total - index);
    objects[index] = object;
    total++;
}

CmObject* ObjectPlaces::take(CmObject** objects, int32& total, int index)
{
    CmObject* object = objects[index];
    total--;
    move(objects + index, objects + index + 1, total - index);
    objects[total] = nullptr;
    return object;
}

int ObjectPlaces::indexAbs(CmObject* const* objects, int total, const CmObject* object)
{
    for (int i = 0; i < total; i++)
        if (objects[i] == object)
            return i;
    return -1;
}

int ObjectPlaces::bisect(CmObject* const* objects, const CmObject* object, int low, int high)
{
    while (low <= high)
    {
        const int middle = low + (high - low) / 2;
        const int order = object->compare(objects[middle]);
        if (order == 0)
            return middle;
        if (order < 0)
            high = middle - 1;
        else
            low = middle + 1;
    }
    return low;
}

int ObjectPlaces::behindEqual(CmObject* const* objects, int total, const CmObject* object, int place)
{
    while (place < total && object->compare(objects[place]) >= 0)
        place++;
    return place;
}

void ObjectPlaces::sort(CmObject** objects, int total)
{
    // Unlike std::sort, this one stays within the array where `compare` contradicts itself, as that of an
    // association without a key does.
    std::stable_sort(objects, objects + total, &cmpObjs);
}
