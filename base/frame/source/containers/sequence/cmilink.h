#pragma once

#include "foundation/object/cmobject.h"

/// An element that carries its own link: it can stand in only one CmILinkedList at a time. A copy stands in none.
/// One thread at a time.
class CmILink : public CmObject
{
    DECLARE_CLASS(CmILink, CmObject)

    CmILink() = default;
    CmILink(const CmILink& other) : CmObject(other) {}
    CmILink& operator=(const CmILink&) { return *this; }

    /// The list's own.
    CmILink* next = nullptr;
};

/// An element that carries its own links: it can stand in only one CmIDLinkedList at a time. A copy stands in none.
/// One thread at a time.
class CmIDLink : public CmObject
{
    DECLARE_CLASS(CmIDLink, CmObject)

    CmIDLink() = default;
    CmIDLink(const CmIDLink& other) : CmObject(other) {}
    CmIDLink& operator=(const CmIDLink&) { return *this; }

    /// The list's own.
    CmIDLink* next = nullptr;
    CmIDLink* previous = nullptr;
};
