#include "services/components/fcomponententry.h"

#include "services/components/fcomponentregistry.h"

constinit FComponentEntry* FComponentEntry::first = nullptr;

FComponentEntry::FComponentEntry(const char* itsCategory, const FUIDBytes& classID, const char* itsName,
                                 FComponentDescription::CreateFunction itsMaker)
    : category(itsCategory),
      uid(classID),
      name(itsName),
      maker(itsMaker),
      next(first)
{
    first = this;
}

void FComponentEntry::registerAll(FComponentRegistry& registry)
{
    for (const FComponentEntry* entry = first; entry; entry = entry->next)
        registry.registerComponent(
            new FComponentDescription(entry->category, FUID(entry->uid), entry->name, entry->maker));
}
