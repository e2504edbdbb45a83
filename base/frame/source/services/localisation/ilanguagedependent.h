#pragma once

#include "containers/typed/tarray.h"

/// An object that wants to know when the language changes; it is registered as long as it lives. *Main thread.*
class ILanguageDependent
{
public:
    ILanguageDependent();
    ILanguageDependent(const ILanguageDependent&) : ILanguageDependent() {}
    ILanguageDependent& operator=(const ILanguageDependent&) = default;
    virtual ~ILanguageDependent();

    virtual void languageChanged() = 0;
};

/// All living language dependents. *Main thread.*
class LanguageDependents
{
public:
    static LanguageDependents& instance();

    void add(ILanguageDependent* dependent);
    void remove(ILanguageDependent* dependent);
    int total() const { return dependents.total(); }
    /// Tells each that is registered when its turn comes; dependents may come and go meanwhile.
    void languageChanged();

private:
    TArray<ILanguageDependent*> dependents;
};
