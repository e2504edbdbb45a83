#pragma once

#include "foundation/object/funknown.h"

/// A calendar date as a component sees it. Each result is 0, or 2 for a null pointer. One thread at a time.
class IDate : public FUnknown
{
public:
    /// 1 to 31; 0 where the date is invalid.
    virtual int32 day(int* result) = 0;
    /// 1 to 12; 0 where the date is invalid.
    virtual int32 month(int* result) = 0;
    virtual int32 year(int* result) = 0;

    DECLARE_INTERFACE_ID
};

/// A date that a component may change. Each result is 0, or 2 where the outcome would be no date; the date is then
/// what it was. One thread at a time.
class IDateModifier : public IDate
{
public:
    virtual int32 setDay(int day) = 0;
    virtual int32 setMonth(int month) = 0;
    virtual int32 setYear(int year) = 0;

    DECLARE_INTERFACE_ID
};
