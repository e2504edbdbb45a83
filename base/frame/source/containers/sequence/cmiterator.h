#pragma once

class CmContainer;
class CmObject;

/// Walks over a container: the cursor stands on an element or past either end, where all give null.
///
/// Made by `newIterator` at the first element and deleted by the caller. It knows nothing of changes in the
/// container but for a `remove` through itself. One thread at a time; several may walk over one container.
class CmIterator
{
public:
    virtual ~CmIterator() = default;

    virtual bool done() const = 0;
    /// Gives the element under the cursor and then moves on.
    virtual CmObject* next() = 0;
    /// Gives the element under the cursor and then moves backwards.
    virtual CmObject* previous() = 0;
    virtual CmObject* current() const = 0;
    virtual CmObject* first() = 0;
    virtual CmObject* last() = 0;
    /// Goes to this very object; where it isn't stored, past the end and false.
    virtual bool setCurrent(CmObject* object);
    /// Moves by so many elements and gives the one under the cursor then.
    virtual CmObject* operator+=(int count);
    virtual CmObject* operator-=(int count);

    /// Goes on to an element equal to `key`, gives it and moves on.
    CmObject* next(CmObject* key);
    CmObject* previous(CmObject* key);

    bool walksOver(const CmContainer* other) const { return container == other; }

protected:
    explicit CmIterator(const CmContainer* walked) : container(walked) {}
    CmIterator(const CmIterator&) = default;
    CmIterator& operator=(const CmIterator&) = default;

private:
    const CmContainer* container;
};
