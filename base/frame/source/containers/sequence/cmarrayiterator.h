#pragma once

#include "containers/sequence/cmarraybase.h"
#include "containers/sequence/cmiterator.h"

/// Walks over the places of a CmArray or CmOrderedArray by index. As a local variable it costs no more than counting.
/// One thread at a time.
class CmArrayIterator final : public CmIterator
{
public:
    explicit CmArrayIterator(const CmArrayBase& walked)
        : CmIterator(&walked),
          places(walked._objects),
          total(walked._total)
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
    // The array's own members, which may change at each step.
    CmObject* const* const& places;
    const int& total;
    int cursor = 0;
};
