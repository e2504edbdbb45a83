#pragma once

#include "containers/sequence/cmnodelist.h"

#include <utility>

/// What the two lists without nodes share: their elements carry the links themselves, and anything else is refused.
///
/// An element can stand in only one such list at a time. So a copy of a list holds copies in mode 1 and is empty in
/// the other modes. It stands between CmContainer and the lists, and is no class of the object model.
/// One thread at a time.
template <class Link>
class CmLinkListOf : public CmNodeList<Link>
{
public:
    void copy(const CmContainer& source) override;

    /// Take all elements of the other list with their references, in constant time; the modes stay.
    void appendList(CmLinkListOf& other);
    void prependList(CmLinkListOf& other);
    /// Removes what is here and takes the elements and the mode of the other list, which is then empty.
    void takeOver(CmLinkListOf& other);
    /// Exchanges the elements and the modes.
    void swap(CmLinkListOf& other);

protected:
    CmLinkListOf() = default;
    CmLinkListOf(const CmLinkListOf&) = delete;
};

template <class Link>
void CmLinkListOf<Link>::copy(const CmContainer& source)
{
    const bool isList = source.isTypeOf(CmNodeRules<Link>::kListName, true);
    if (isList && source.getOwnership() != CmContainer::kTaken)
        this->setOwnership(source.getOwnership());
    else
        CmContainer::copy(source);
}

template <class Link>
void CmLinkListOf<Link>::appendList(CmLinkListOf& other)
{
    if (&other == this || !other._first)
        return;
    (this->_last ? this->_last->next : this->_first) = other._first;
    CmNodeRules<Link>::setPrevious(other._first, this->_last);
    this->_last = std::exchange(other._last, nullptr);
    other._first = nullptr;
    this->_size += std::exchange(other._size, 0);
}

template <class Link>
void CmLinkListOf<Link>::prependList(CmLinkListOf& other)
{
    // The elements change places and then follow; the modes stay.
    swap(other);
    std::swap(this->_ownsObjects, other._ownsObjects);
    appendList(other);
}

template <class Link>
void CmLinkListOf<Link>::takeOver(CmLinkListOf& other)
{
    if (&other == this)
        return;
    this->removeAll();
    this->setOwnership(other.getOwnership());
    appendList(other);
}

template <class Link>
void CmLinkListOf<Link>::swap(CmLinkListOf& other)
{
    std::swap(this->_first, other._first);
    std::swap(this->_last, other._last);
    std::swap(this->_size, other._size);
    std::swap(this->_ownsObjects, other._ownsObjects);
}
