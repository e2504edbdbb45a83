#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/object/iptr.h"
#include "storage/path/fpath.h"

/// A walk over files and folders, in the order in which the folder holds them:
///
///     for (it.first(); !it.done(); it.next())
///         use(it.current());
///
/// One thread at a time.
class IFileIteratorImpl
{
public:
    virtual ~IFileIteratorImpl() = default;
    virtual void first() = 0;
    virtual void next() = 0;
    virtual bool done() = 0;
    /// A path of its own for each call; null at the end.
    virtual IPtr<FPath> current() = 0;
};

/// A walk as an object: hands on to an implementation that it owns. One thread at a time.
class FFileIterator : public CmObject, public IFileIteratorImpl
{
    DECLARE_TYPE(FFileIterator, CmObject)

    /// Takes `implementation` over; null is an empty walk.
    explicit FFileIterator(IFileIteratorImpl* implementation);
    FFileIterator(const FFileIterator&) = delete;
    FFileIterator& operator=(const FFileIterator&) = delete;
    ~FFileIterator() override;
    CmObject* newCopy() const override { return nullptr; }

    void first() override;
    void next() override;
    bool done() override;
    IPtr<FPath> current() override;

private:
    IFileIteratorImpl* target;
};
