#include "foundation/object/singleton.h"

#include "foundation/object/fobject.h"

TArray<FObject**>* Singleton::singletonInstances = nullptr;
bool Singleton::singletonsTerminated = false;
Singleton::Deleter Singleton::deleter;

Singleton::Deleter::~Deleter()
{
    terminate();
}

void Singleton::registerInstance(FObject** holder)
{
    if (singletonsTerminated)
        return;
    if (!singletonInstances)
        singletonInstances = new TArray<FObject**>(0, 10);
    singletonInstances->add(holder);
}

void Singleton::terminate()
{
    singletonsTerminated = true;
    if (!singletonInstances)
        return;
    for (FObject** holder : *singletonInstances)
    {
        if (*holder)
            (*holder)->release();
        *holder = nullptr;
    }
    delete singletonInstances;
    singletonInstances = nullptr;
}
