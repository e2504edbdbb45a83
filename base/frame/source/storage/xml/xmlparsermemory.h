#pragma once

#include <cstddef>

/// What the XML library may hold for one parser: it keeps each distinct name of a document until the end, so that a
/// document of nothing but new names would take many times its size. Beyond the limit it gets no more and reports that
/// memory ran out. Must outlive the parser. One thread at a time.
class XmlParserMemory
{
public:
    explicit XmlParserMemory(size_t bytes) : left(bytes) {}
    XmlParserMemory(const XmlParserMemory&) = delete;
    XmlParserMemory& operator=(const XmlParserMemory&) = delete;

    /// While it lives, this thread allocates from `memory`. The library's functions have no argument to tell whose
    /// call they serve, and a handler may run another parser.
    class Scope
    {
    public:
        explicit Scope(XmlParserMemory& memory);
        ~Scope();
        Scope(const Scope&) = delete;
        Scope& operator=(const Scope&) = delete;

    private:
        XmlParserMemory* former;
    };

    // As malloc, realloc and free. New blocks need a scope; the others know where they belong.
    static void* allocate(size_t size);
    static void* resize(void* block, size_t size);
    static void release(void* block);

private:
    struct Head;

    size_t left;
};
