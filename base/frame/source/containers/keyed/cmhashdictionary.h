#pragma once

#include "containers/keyed/cmdictionaryof.h"
#include "containers/keyed/cmhashtable.h"

/// A pair with its place in a chain, so that a search finds both at one go. It passes for a CmAssociation, and is no
/// class of the object model. One thread at a time.
class CmHashAssociation final : public CmAssociation, private CmHashNode
{
public:
    FPOOLED_OBJECTS

    CmHashAssociation(CmObject* itsKey, CmObject* itsObject) : CmAssociation(itsKey, itsObject), CmHashNode{}
    {
    }
    CmHashAssociation(const CmHashAssociation&) = delete;
    CmHashAssociation& operator=(const CmHashAssociation&) = delete;

    CmHashNode* ownNode() override { return this; }
    /// The pair that `node` is part of; it has to be part of one.
    static CmHashAssociation* around(CmHashNode* node) { return static_cast<CmHashAssociation*>(node); }
};

/// A table of CmAssociations, which may bring their nodes along. It stands between CmHashTable and CmHashDictionary, and
/// is no class of the object model. One thread at a time.
class CmAssociationTable : public CmHashTable
{
protected:
    using CmHashTable::CmHashTable;

    /// The first association whose key is equal to `key`; null where there is none.
    CmAssociation* lookupKey(const CmObject* key) const;
    /// As takeEqual, by the key.
    CmAssociation* takeKey(const CmObject* key);
    CmHashNode* makeNode(CmObject* object) override;
    void dropNode(CmHashNode* node) override;

private:
    /// Whether all elements hash and compare as their keys do, so that there is no need for an association to ask.
    bool isSearchedByKey() const { return _apart == 0 && !hashFunction() && _size > 0; }

    /// The number of nodes that are no part of a pair.
    int32 _apart = 0;
};

template <>
CmAssociation* CmDictionaryOf<CmAssociationTable, CmHashAssociation>::findPair(const CmObject* key) const;
template <>
CmAssociation* CmDictionaryOf<CmAssociationTable, CmHashAssociation>::takePair(const CmObject* key);
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
