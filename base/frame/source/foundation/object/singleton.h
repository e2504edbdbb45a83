#pragma once

#include "containers/typed/tarray.h"

class FObject;

/// Takes down process-wide objects at the end of the process, first made first.
///
/// The pattern of every `instance`: where the static pointer is null and `isTerminated` is false, make the object,
/// store it in the pointer and register the pointer's address. Code that may run late allows for a null instance.
/// Main thread.
class Singleton
{
public:
    /// `holder` is the variable that holds the instance; it is released and cleared at the end of the process.
    static void registerInstance(FObject** holder);
    static bool isTerminated() { return singletonsTerminated; }

private:
    struct Deleter
    {
        ~Deleter();
    };

    static void terminate();

    static TArray<FObject**>* singletonInstances;
    static bool singletonsTerminated;
    static Deleter deleter;
};
