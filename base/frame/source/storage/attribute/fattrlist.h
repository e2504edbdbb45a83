#pragma once

#include "foundation/object/cmobject.h"

class FVariant;

/// A queue of values under one key of an attribute tree. Reading moves on and doesn't use the values up.
/// One thread at a time.
class FAttrList : public CmObject
{
    DECLARE_ABSTRACT_CLASS(FAttrList, CmObject)

    virtual int total() const = 0;
    /// Reads the next value; what is no number is borrowed. False at the end.
    virtual bool unqueueVariant(FVariant& value) = 0;
    void reset() { position = 0; }
    /// The index of the value that is read next.
    int getPosition() const { return position; }

protected:
    /// The index of the value to read, moving on; -1 at the end.
    int advance() { return position < total() ? position++ : -1; }

    int32 position = 0;
};
