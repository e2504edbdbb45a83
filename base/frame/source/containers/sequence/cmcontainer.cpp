#include "containers/sequence/cmcontainer.h"

#include "containers/sequence/cmarray.h"
#include "containers/sequence/cmiterator.h"
#include "containers/sequence/cmobjectfilter.h"

#include <memory>

DEFINE_ABSTRACT_CLASS(CmContainer, CmObject)

namespace
{
using IteratorHolder = std::unique_ptr<CmIterator>;

IteratorHolder iterate(const CmContainer& container)
{
    return IteratorHolder(container.newIterator());
}

// The elements as they are now, for a caller that changes the container on the way.
CmArray elementsOf(const CmContainer& container)
{
    CmArray result(container.total());
    for (IteratorHolder it = iterate(container); !it->done();)
        result.add(it->next());
    return result;
}
} // namespace

// Defaults of the contract

CmObject* CmContainer::at(int index) const
{
    if (index < 0)
        return nullptr;
    const IteratorHolder it = iterate(*this);
    return *it += index;
}

CmObject* CmContainer::lookup(const CmObject* object) const
{
    if (object)
        for (IteratorHolder it = iterate(*this); !it->done(); it->next())
            if (it->current()->isEqual(object))
                return it->current();
    return nullptr;
}

bool CmContainer::contains(const CmObject* object) const
{
    return getIndex(object) >= 0;
}

bool CmContainer::containsAbs(const CmObject* object) const
{
    for (IteratorHolder it = iterate(*this); !it->done();)
        if (it->next() == object)
            return true;
    return false;
}

int CmContainer::occurrences(const CmObject* object) const
{
    int count = 0;
    if (object)
        for (IteratorHolder it = iterate(*this); !it->done();)
            if (it->next()->isEqual(object))
                count++;
    return count;
}

int CmContainer::getIndex(const CmObject* object) const
{
    int index = 0;
    if (object)
        for (IteratorHolder it = iterate(*this); !it->done(); index++)
            if (it->next()->isEqual(object))
                return index;
    return -1;
}

void CmContainer::copy(const CmContainer& source)
{
    if (&source == this)
        return;
    _ownsObjects = source._ownsObjects;
    addAllFrom(&source);
}

// From and to other containers

bool CmContainer::addAllFrom(const CmContainer* other)
{
    if (!other)
        return false;
    if (other == this)
    {
        const CmArray elements = elementsOf(*this);
        return addAllFrom(&elements);
    }
    bool isComplete = true;
    for (IteratorHolder it = iterate(*other); !it->done();)
        isComplete = addFromOther(it->next()) && isComplete;
    return isComplete;
}

bool CmContainer::takeAllFrom(const CmContainer* other, bool retain)
{
    if (!other)
        return false;
    if (other == this)
    {
        const CmArray elements = elementsOf(*this);
        return takeAllFrom(&elements, retain);
    }
    const int16 mode = _ownsObjects;
    _ownsObjects = kShared;
    bool isComplete = true;
    for (IteratorHolder it = iterate(*other); !it->done();)
    {
        CmObject* object = it->next();
        const bool isAdded = add(object);
        if (isAdded && retain)
            object->addRef();
        isComplete = isComplete && isAdded;
    }
    _ownsObjects = mode;
    return isComplete;
}

void CmContainer::removeAllFrom(const CmContainer* other)
{
    if (!other)
        return;
    if (other == this)
    {
        removeAll();
        return;
    }
    for (IteratorHolder it = iterate(*other); !it->done();)
        remove(it->next());
}

CmArray* CmContainer::lookupAll(const CmObject* object) const
{
    auto* result = new CmArray;
    if (object)
        for (IteratorHolder it = iterate(*this); !it->done(); it->next())
            if (it->current()->isEqual(object))
                result->add(it->current());
    return result;
}

bool CmContainer::addFromOther(CmObject* element)
{
    if (_ownsObjects != kTaken)
        return add(element);
    CmObject* copied = element->newCopy();
    if (add(copied))
        return true;
    if (copied)
        copied->release();
    return false;
}

bool CmContainer::addRestored(CmObject* element)
{
    if (add(element))
        return true;
    element->release();
    return false;
}

// Through a filter

bool CmContainer::query(CmObjectFilter& filter, CmContainer& result) const
{
    if (&result == this)
    {
        const CmArray elements = elementsOf(*this);
        return elements.query(filter, result);
    }
    bool hasPassed = false;
    for (IteratorHolder it = iterate(*this); !it->done();)
    {
        CmObject* object = it->next();
        if (!filter.check(object))
            continue;
        result.add(object);
        hasPassed = true;
    }
    return hasPassed;
}

CmObject* CmContainer::firstThat(CmObjectFilter& filter) const
{
    for (IteratorHolder it = iterate(*this); !it->done(); it->next())
        if (filter.check(it->current()))
            return it->current();
    return nullptr;
}

CmObject* CmContainer::lastThat(CmObjectFilter& filter) const
{
    // Going backwards is slow in a list and in a hash table.
    const CmArray elements = elementsOf(*this);
    for (int i = elements.total() - 1; i >= 0; i--)
        if (filter.check(elements.at(i)))
            return elements.at(i);
    return nullptr;
}

bool CmContainer::forEach(CmObjectFilter& filter) const
{
    for (IteratorHolder it = iterate(*this); !it->done();)
        if (!filter.check(it->next()))
            return false;
    return true;
}
