#include "services/localisation/ilanguagedependent.h"

ILanguageDependent::ILanguageDependent()
{
    LanguageDependents::instance().add(this);
}

ILanguageDependent::~ILanguageDependent()
{
    LanguageDependents::instance().remove(this);
}

LanguageDependents& LanguageDependents::instance()
{
    static LanguageDependents dependents;
    return dependents;
}

void LanguageDependents::add(ILanguageDependent* dependent)
{
    dependents.add(dependent);
}

void LanguageDependents::remove(ILanguageDependent* dependent)
{
    dependents.remove(dependent);
}

void LanguageDependents::languageChanged()
{
    const TArray<ILanguageDependent*> told(dependents);
    for (ILanguageDependent* dependent : told)
        if (dependents.contains(dependent))
            dependent->languageChanged();
}
