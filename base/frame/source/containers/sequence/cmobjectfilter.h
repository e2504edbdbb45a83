#pragma once

class CmObject;

/// A question that a container asks of its elements. One thread at a time but for `concurrentIteration`.
class CmObjectFilter
{
public:
    virtual ~CmObjectFilter() = default;
    virtual bool check(CmObject* object) = 0;

protected:
    CmObjectFilter() = default;
    CmObjectFilter(const CmObjectFilter&) = default;
    CmObjectFilter& operator=(const CmObjectFilter&) = default;
};

/// Passes one very object.
class CmIdentityFilter : public CmObjectFilter
{
public:
    explicit CmIdentityFilter(const CmObject* wanted) : object(wanted) {}
    bool check(CmObject* candidate) override { return candidate == object; }

private:
    const CmObject* object;
};

/// Passes objects of exactly one class. The name is borrowed.
class CmIsAFilter : public CmObjectFilter
{
public:
    explicit CmIsAFilter(const char* name) : className(name) {}
    bool check(CmObject* object) override;

private:
    const char* className;
};

/// Passes objects of a class and of those derived from it. The name is borrowed.
class CmTypeFilter : public CmObjectFilter
{
public:
    explicit CmTypeFilter(const char* name) : className(name) {}
    bool check(CmObject* object) override;

private:
    const char* className;
};

/// Passes what both of two filters pass; the second is asked only where the first passes. They are borrowed.
class CmMacroFilter : public CmObjectFilter
{
public:
    CmMacroFilter(CmObjectFilter& firstAsked, CmObjectFilter& secondAsked)
        : first(firstAsked),
          second(secondAsked)
    {
    }
    bool check(CmObject* object) override { return first.check(object) && second.check(object); }

private:
    CmObjectFilter& first;
    CmObjectFilter& second;
};
