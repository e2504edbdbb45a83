#pragma once

#include "containers/keyed/cmassociation.h"
#include "containers/sequence/cmiterator.h"

/// The operations that the three dictionaries share, on the container that holds their associations. It stands
/// between that container and them, and is no class of the object model. `Association` is what `add` makes of a pair.
///
/// Keys are unique. In modes 1 and 2 key and object are released when they leave; the association is the
/// dictionary's own in every mode. Beware: in mode 2 `add` gives key and object no reference, so use modes 0 and 1.
/// One thread at a time.
template <class Container, class Association = CmAssociation>
class CmDictionaryOf : public Container
{
public:
    /// False where an equal key is present; the stored pair stays, and the references stay with the caller.
    bool add(CmObject* key, CmObject* object);
    /// Takes a CmAssociation under the same test; anything else gives false.
    bool add(CmObject* association) override;
    /// Removes the association with an equal key.
    bool remove(CmObject* key) override;
    bool remove(const CmIterator& position) override;
    bool removeAt(int index) override;
    void removeAll() override;
    /// Puts another object under the key; the old one leaves. False where the key is absent.
    bool replace(const CmObject* key, CmObject* newObject);

    /// The object under an equal key, borrowed; null where there is none.
    CmObject* lookupObject(const CmObject* key) const;
    CmObject* lookup(const CmObject* key) const override { return lookupObject(key); }
    CmAssociation* lookupAssoc(const CmObject* key) const;
    bool contains(const CmObject* key) const override { return lookupAssoc(key) != nullptr; }
    int occurrences(const CmObject* key) const override;

protected:
    using Container::Container;
    CmDictionaryOf() = default;
    CmDictionaryOf(const CmDictionaryOf&) = delete;
    ~CmDictionaryOf() override { CmDictionaryOf::removeAll(); }

    bool addFromOther(CmObject* element) override;
    bool addRestored(CmObject* element) override;

private:
    /// What an association holds, kept beyond its end.
    struct Pair
    {
        explicit Pair(CmObject* element)
            : association(static_cast<CmAssociation*>(element)),
              key(association->getKey()),
              object(association->getObject())
        {
        }

        CmAssociation* association;
        CmObject* key;
        CmObject* object;
    };

    Pair takeOver(CmObject* element) const;
    void giveUp(const Pair& pair);
};
