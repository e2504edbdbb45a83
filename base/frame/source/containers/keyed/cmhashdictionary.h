#pragma once

#include "containers/keyed/cmdictionaryof.h"
#include "containers/keyed/cmhashtable.h"

/// A pair with its place in a chain, so that a search finds both at one go. It passes for a CmAssociation, and is no
/// class of the object model. One thread at a time.
class CmHashAssociation final : public CmAssociation, private CmHashNode
{
public:
    // Both bases have these operators.
    FPOOLED_OBJECTS

    CmHashAssociation(CmObject* itsKey, CmObject* itsObject) : CmAssociation(itsKey, itsObject), CmHashNode{}
    {
    }
    CmHashAssociation(const CmHashAssociation&) = delete;
    CmHashAssociation& operator=(const CmHashAssociation&) = delete;

    CmHashAssociation* withNode() override { return this; }
    CmHashNode* ownNode() { return this; }
    /// The pair that `node` is part of; it has to be part of one.
    static CmHashAssociation* around(CmHashNode* node) { return static_cast<CmHashAssociation*>(node); }
};

/// A table of CmAssociations, which may bring their nodes along. It stands between CmHashTable and CmHashDictionary, and
/// is no class of the object model. One thread at a time.
class CmAssociationTable : public CmHashTable
{
protected:
    using CmHashTable::CmHashTable;
    CmAssociationTable& operator=(const CmAssociationTable&) = delete;

    // As those for objects. `probe` is of no derived class and has a key.
    using CmHashTable::lookup;
    using CmHashTable::takeEqual;
    CmObject* lookup(const CmAssociation* probe) const;
    CmObject* takeEqual(const CmAssociation* probe);
    CmHashNode* makeNode(CmObject* object) override;
    void dropNode(CmHashNode* node) override;

private:
    /// Whether the chains can be searched by the key itself: there are buckets, and every element is a
    /// CmHashAssociation in the bucket that its key's hash told.
    bool isSearchedByKey() const { return _apart == 0 && !hashFunction() && _size > 0; }

    /// The number of nodes that are no part of a CmHashAssociation.
    int32 _apart = 0;
};

extern template class CmDictionaryOf<CmAssociationTable, CmHashAssociation>;

/// The dictionary for text keys, found by hash. One thread at a time.
///
/// A hash function that is set gets associations.
class CmHashDictionary : public CmDictionaryOf<CmAssociationTable, CmHashAssociation>
{
    DECLARE_CLASS(CmHashDictionary, CmHashTable)

    explicit CmHashDictionary(int size = 10) : CmDictionaryOf(size) {}
    CmHashDictionary(const CmHashDictionary& other) : CmDictionaryOf(SettingsOf{other})
    {
        CmContainer::copy(other);
    }
    CmHashDictionary& operator=(const CmHashDictionary& other) { return assign(*this, other); }
};
