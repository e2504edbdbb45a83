#pragma once

#include "containers/keyed/cmdictionaryof.h"
#include "containers/sequence/cmcontainer.h"
#include "foundation/object/iptr.h"

#include <memory>
#include <vector>

// The bodies of CmDictionaryOf, for the sources that instantiate it.

template <class Container, class Association>
bool CmDictionaryOf<Container, Association>::add(CmObject* key, CmObject* object)
{
    auto* association = new Association(key, object);
    const bool isAdded = add(association);
    // In mode 2 the container holds a reference of its own.
    if (!isAdded || this->_ownsObjects == CmContainer::kRetained)
        association->release();
    return isAdded;
}

template <class Container, class Association>
bool CmDictionaryOf<Container, Association>::add(CmObject* object)
{
    CmAssociation* association = FCast(CmAssociation, object);
    if (!association || !association->getKey() || !Container::addUnique(object))
        return false;
    if (this->_ownsObjects != CmContainer::kShared)
        association->handOver();
    return true;
}

template <class Container, class Association>
bool CmDictionaryOf<Container, Association>::remove(CmObject* key)
{
    const CmAssociation probe(key);
    CmObject* association = key ? Container::takeEqual(&probe) : nullptr;
    if (!association)
        return false;
    const Pair pair = takeOver(association);
    this->testDelete(association);
    giveUp(pair);
    return true;
}

template <class Container, class Association>
bool CmDictionaryOf<Container, Association>::remove(const CmIterator& position)
{
    if (!position.walksOver(this) || position.done())
        return false;
    const Pair pair = takeOver(position.current());
    Container::remove(position);
    giveUp(pair);
    return true;
}

template <class Container, class Association>
bool CmDictionaryOf<Container, Association>::removeAt(int index)
{
    CmObject* association = this->at(index);
    if (!association)
        return false;
    const Pair pair = takeOver(association);
    Container::removeAt(index);
    giveUp(pair);
    return true;
}

template <class Container, class Association>
void CmDictionaryOf<Container, Association>::removeAll()
{
    std::vector<Pair> pairs;
    for (std::unique_ptr<CmIterator> it(this->newIterator()); !it->done();)
        pairs.push_back(takeOver(it->next()));
    // The pairs are out before they are released: a destructor may look at this dictionary.
    Container::removeAll();
    for (const Pair& pair : pairs)
        giveUp(pair);
}

template <class Container, class Association>
bool CmDictionaryOf<Container, Association>::replace(const CmObject* key, CmObject* newObject)
{
    CmAssociation* association = lookupAssoc(key);
    if (!association)
        return false;
    CmObject* replaced = takeOver(association).object;
    // An object that takes its own place must not be released for it.
    if (replaced == newObject)
        return true;
    association->setObject(newObject);
    this->testDelete(replaced);
    return true;
}

template <class Container, class Association>
CmObject* CmDictionaryOf<Container, Association>::lookupObject(const CmObject* key) const
{
    const CmAssociation* association = lookupAssoc(key);
    return association ? association->getObject() : nullptr;
}

template <class Container, class Association>
CmAssociation* CmDictionaryOf<Container, Association>::lookupAssoc(const CmObject* key) const
{
    if (!key)
        return nullptr;
    const CmAssociation probe(const_cast<CmObject*>(key));
    return static_cast<CmAssociation*>(Container::lookup(&probe));
}

template <class Container, class Association>
int CmDictionaryOf<Container, Association>::occurrences(const CmObject* key) const
{
    return lookupAssoc(key) ? 1 : 0;
}

template <class Container, class Association>
bool CmDictionaryOf<Container, Association>::addFromOther(CmObject* element)
{
    // An association belongs to one dictionary, so each gets its own.
    const CmAssociation* association = FCast(CmAssociation, element);
    if (!association)
        return false;
    CmObject* key = association->getKey();
    CmObject* object = association->getObject();
    const int16 mode = this->_ownsObjects;
    if (mode == CmContainer::kTaken)
    {
        key = key ? key->newCopy() : nullptr;
        object = object ? object->newCopy() : nullptr;
    }
    const bool isAdded = add(key, object);
    for (CmObject* member : {key, object})
    {
        if (member && isAdded && mode == CmContainer::kRetained)
            member->addRef();
        if (member && !isAdded && mode == CmContainer::kTaken)
            member->release();
    }
    return isAdded;
}

template <class Container, class Association>
bool CmDictionaryOf<Container, Association>::addRestored(CmObject* element)
{
    // An attribute tree may give the same association to several dictionaries, so each makes its own.
    const IPtr<CmObject> restored = adopt(element);
    const CmAssociation* association = FCast(CmAssociation, element);
    if (!association || !add(association->getKey(), association->getObject()))
        return false;
    association->getKey()->addRef();
    if (association->getObject())
        association->getObject()->addRef();
    return true;
}

// A pair that was added in mode 0 may still hold what it was restored with, which is the dictionary's by now.
template <class Container, class Association>
auto CmDictionaryOf<Container, Association>::takeOver(CmObject* element) const -> Pair
{
    const Pair pair(element);
    if (this->_ownsObjects != CmContainer::kShared)
        pair.association->handOver();
    return pair;
}

// What an association that has left held; in mode 0 the association itself is still to be released.
template <class Container, class Association>
void CmDictionaryOf<Container, Association>::giveUp(const Pair& pair)
{
    this->testDelete(pair.key);
    this->testDelete(pair.object);
    if (this->_ownsObjects == CmContainer::kShared)
        pair.association->release();
}
