#pragma once

#include "containers/keyed/cmdictionaryof.h"
#include "containers/keyed/cmhashtable.h"

/// A pair with its place in a chain, so that a search finds both at one go. It passes for a CmAssociation, and is no
/// class of the object model. One thread at a time.
class CmHashAssociation final : public CmAssociation
{
public:
    using CmAssociation::CmAssociation;
    CmHashAssociation(const CmHashAssociation&) = delete;
    CmHashAssociation& operator=(const CmHashAssociation&) = delete;

    CmHashNode* ownNode() override { return &node; }

private:
    CmHashNode node = {};
};

/// A table of CmAssociations, which may bring their nodes along. It stands between CmHashTable and CmHashDictionary, and
/// is no class of the object model. One thread at a time.
class CmAssociationTable : public CmHashTable
{
protected:
    using CmHashTable::CmHashTable;

    CmHashNode* makeNode(CmObject* object) override;
    void dropNode(CmHashNode* node) override;
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
