#include "application/onetimeprocedure.h"

constinit OneTimeProcedure::List* OneTimeProcedure::initializers = nullptr;
constinit OneTimeProcedure::List* OneTimeProcedure::terminators = nullptr;
constinit bool OneTimeProcedure::initializePerformed = false;

OneTimeProcedure::OneTimeProcedure(const char* procedureName, unsigned procedureLevel, bool (*procedure)(),
                                   Kind kind)
    : name(procedureName),
      level(procedureLevel),
      function(procedure)
{
    enter(kind == kInitializer ? initializers : terminators, this);
}

OneTimeProcedure::~OneTimeProcedure()
{
    leave(initializers, this);
    leave(terminators, this);
}

void OneTimeProcedure::enter(List*& list, OneTimeProcedure* procedure)
{
    if (!list)
        list = new List(64);
    list->add({procedure->level, procedure});
}

void OneTimeProcedure::leave(List* list, OneTimeProcedure* procedure)
{
    for (int i = list ? list->total() - 1 : -1; i >= 0; i--)
        if ((*list)[i].procedure == procedure)
            list->removeAt(i);
}

void OneTimeProcedure::drop(List*& list)
{
    delete list;
    list = nullptr;
}

bool OneTimeProcedure::initialize(unsigned upToLevel)
{
    initializePerformed = true;
    // One at a time: a procedure may initialize further, or make others.
    while (initializers && !initializers->isEmpty() && (*initializers)[0].level <= upToLevel)
    {
        const OneTimeProcedure* procedure = (*initializers)[0].procedure;
        initializers->removeAt(0);
        if (!procedure->function())
        {
            drop(initializers);
            return false;
        }
    }
    if (initializers && initializers->isEmpty())
        drop(initializers);
    return true;
}

void OneTimeProcedure::terminate()
{
    if (!initializePerformed)
        return;
    for (int i = 0; terminators && i < terminators->total(); i++)
        (*terminators)[i].procedure->function();
    drop(terminators);
}

void OneTimeProcedure::cancel()
{
    drop(initializers);
    drop(terminators);
}
