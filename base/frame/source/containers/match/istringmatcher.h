#pragma once

#include "containers/value/bitset.h"
#include "foundation/object/funknown.h"

/// How a candidate matched. A value; one thread at a time.
struct StringMatchInfos
{
    /// Kinds, the better ones first.
    enum Kind : int32
    {
        kWhole = 0,   ///< the candidate is the search text, but for the case of letters
        kPart = 1,    ///< the candidate contains it
        kSimilar = 2, ///< a few changes lead from one to the other
    };

    int32 kind = kWhole;
    /// How many characters must be put in, left out or changed. 0 but for `kSimilar`.
    int32 distance = 0;
    /// One bit for each character of the candidate; set where it was found in the search text.
    BitSet matchedCharacters;
};

/// An object as it appears among others in a list to search.
class IObjectDescription : public FUnknown
{
public:
    /// What the user would type to find the object; borrowed. Null is the empty text, which nothing finds.
    virtual const char16* getDescription() = 0;

    DECLARE_INTERFACE_ID
};

/// What is searched.
class IObjectDescriptionList : public FUnknown
{
public:
    virtual int countItems() = 0;
    /// Borrowed; null out of range.
    virtual IObjectDescription* getObjectDescription(int index) = 0;

    DECLARE_INTERFACE_ID
};

/// What was found, the best first.
class IStringMatchResultList : public FUnknown
{
public:
    virtual int countItems() = 0;
    /// Borrowed, as the other; null out of range.
    virtual IObjectDescription* getObjectDescription(int index) = 0;
    virtual const StringMatchInfos* getMatchInfos(int index) = 0;

    DECLARE_INTERFACE_ID
};

/// Finds what somebody means who types a part of its name or mistypes it.
class IStringMatcher : public FUnknown
{
public:
    /// `infos`, which may be null, is filled for a match and left alone otherwise.
    virtual bool isMatch(const char16* candidate, StringMatchInfos* infos) = 0;
    /// The candidates that match, with a reference for the caller.
    virtual IStringMatchResultList* filterCandidates(IObjectDescriptionList* candidates) = 0;

    DECLARE_INTERFACE_ID
};
