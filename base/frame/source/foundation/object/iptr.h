#pragma once

#include "foundation/object/funknown.h"

#include <utility>

/// Holds one reference on any FUnknown descendant; null is legal.
///
/// Taking a pointer adds a reference. Use `adopt` for a pointer whose reference is already the caller's: a result of
/// `new`, `newCopy`, `queryInterface` or a factory. One thread at a time.
template <class T>
class IPtr
{
public:
    IPtr() = default;
    IPtr(std::nullptr_t) {}
    IPtr(T* pointer) : target(pointer) { hold(); }
    IPtr(const IPtr& other) : target(other.target) { hold(); }
    IPtr(IPtr&& other) noexcept : target(std::exchange(other.target, nullptr)) {}
    template <class Other>
    IPtr(const IPtr<Other>& other) : target(other.get())
    {
        hold();
    }
    ~IPtr() { drop(); }

    IPtr& operator=(IPtr other) noexcept
    {
        std::swap(target, other.target);
        return *this;
    }

    /// Takes over the caller's reference.
    static IPtr adopt(T* pointer)
    {
        IPtr result;
        result.target = pointer;
        return result;
    }
    /// Hands the reference to the caller and holds nothing thereafter.
    [[nodiscard]] T* take() { return std::exchange(target, nullptr); }

    T* get() const { return target; }
    T* operator->() const { return target; }
    T& operator*() const { return *target; }
    operator T*() const { return target; }

private:
    void hold()
    {
        if (target)
            target->addRef();
    }
    void drop()
    {
        if (target)
            target->release();
    }

    T* target = nullptr;
};

/// Adopts a fresh object: `auto text = adopt(new CmString(u"a"))`.
template <class T>
IPtr<T> adopt(T* pointer)
{
    return IPtr<T>::adopt(pointer);
}
