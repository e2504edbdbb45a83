#pragma once

#include "services/components/fcomponentdescription.h"

class FComponentRegistry;

/// A component that this program brings along: a static object beside the component's class.
///
/// Whether there is such a component is decided by what is linked; nobody needs to name it. The entries are noted
/// before `main`, and registered when the process gets its registry, in no set order. *Immutable* after that.
class FComponentEntry
{
public:
    /// The texts are literals. `maker` makes an object at reference count 1.
    FComponentEntry(const char* itsCategory, const FUIDBytes& classID, const char* itsName,
                    FComponentDescription::CreateFunction itsMaker);
    FComponentEntry(const FComponentEntry&) = delete;
    FComponentEntry& operator=(const FComponentEntry&) = delete;

    static void registerAll(FComponentRegistry& registry);

private:
    const char* category;
    FUIDBytes uid;
    const char* name;
    FComponentDescription::CreateFunction maker;
    FComponentEntry* next;

    static constinit FComponentEntry* first;
};
