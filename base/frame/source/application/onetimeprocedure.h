#pragma once

#include "containers/typed/tarray.h"

/// A function that runs once at start-up or shut-down, at a numbered level.
///
/// Made as static objects, so that they stand before `main`; they keep themselves in two process-wide lists in the
/// order of their levels, and within a level in that of registration. *Main thread*.
class OneTimeProcedure
{
public:
    enum Kind
    {
        kInitializer,
        kTerminator
    };

    /// `procedureName` serves debugging and is not copied. A terminator's result is not looked at.
    OneTimeProcedure(const char* procedureName, unsigned procedureLevel, bool (*procedure)(),
                     Kind kind = kInitializer);
    ~OneTimeProcedure();
    OneTimeProcedure(const OneTimeProcedure&) = delete;
    OneTimeProcedure& operator=(const OneTimeProcedure&) = delete;

    const char* getName() const { return name; }

    /// Runs every initializer up to this level that has not run yet. False at the first one that fails: no other
    /// initializer runs from then on.
    static bool initialize(unsigned level);
    /// Runs all terminators, if `initialize` was ever called.
    static void terminate();
    /// Forgets all that has not run.
    static void cancel();

private:
    struct Entry
    {
        unsigned level;
        OneTimeProcedure* procedure;

        bool operator<(const Entry& other) const { return level < other.level; }
        bool operator==(const Entry& other) const = default;
    };
    using List = TOrderedArray<Entry>;

    static void enter(List*& list, OneTimeProcedure* procedure);
    static void leave(List* list, OneTimeProcedure* procedure);
    static void drop(List*& list);

    const char* name;
    unsigned level;
    bool (*function)();

    static constinit List* initializers;
    static constinit List* terminators;
    static constinit bool initializePerformed;
};
