#pragma once

#include "containers/sequence/cmiterator.h"

/// Walks over the places of a CmArray or CmOrderedArray by index. One thread at a time.
class CmArrayIterator : public CmIterator
{
public:
    /// `placeHolder` and `totalHolder` are the array's own members, read at each step.
    CmArrayIterator(const CmContainer* array, CmObject* const* const& placeHolder, const int& totalHolder)
        : CmIterator(array),
          places(placeHolder),
          total(totalHolder)
    {
    }

    using CmIterator::next;
    using CmIterator::previous;
    bool done() const override { return cursor < 0 || cursor >= total; }
    CmObject* next() override { return done() ? nullptr : places[cursor++]; }
    CmObject* previous() override { return done() ? nullptr : places[cursor--]; }
    CmObject* current() const override { return done() ? nullptr : places[cursor]; }
    CmObject* first() override;
    CmObject* last() override;
    CmObject* operator+=(int count) override;
    CmObject* operator-=(int count) override;

    /// The index under the cursor; beyond the elements when done.
    int index() const { return cursor; }

private:
    CmObject* const* const& places;
    const int& total;
    int cursor = 0;
};
