#pragma once

class FUnknown;

/// A loaded library of components. It stays loaded while it has instances. Main thread.
class FModule
{
public:
    virtual void addInstance(FUnknown* instance) = 0;
    virtual void releaseInstance(FUnknown* instance) = 0;

protected:
    FModule() = default;
    FModule(const FModule&) = default;
    FModule& operator=(const FModule&) = default;
    virtual ~FModule() = default;
};
