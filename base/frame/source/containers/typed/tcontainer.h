#pragma once

#include <memory>

/// Walks over a typed container: the cursor stands on an element or past either end.
///
/// Made by `newIterator` and deleted by the caller. It knows nothing of changes in the container. Where there is no
/// element, an operation gives the empty value `T()`. References stay good until the container changes.
/// One thread at a time.
template <class T>
class TIterator
{
public:
    virtual ~TIterator() = default;
    virtual bool done() const = 0;
    /// Gives the element under the cursor and then moves on.
    virtual const T& next() = 0;
    /// Gives the element under the cursor and then moves backwards.
    virtual const T& previous() = 0;
    virtual const T& current() const = 0;
    virtual const T& first() = 0;
    virtual const T& last() = 0;

protected:
    TIterator() = default;
    TIterator(const TIterator&) = default;
    TIterator& operator=(const TIterator&) = default;
};

/// The contract of the typed containers: values of a copyable type with an empty value and `operator==`.
///
/// They have no ownership mode: what an element holds, its destructor gives back, so a container of IPtr holds
/// references. One thread at a time.
template <class T>
class TContainer
{
public:
    virtual ~TContainer() = default;

    virtual int total() const;
    virtual bool isEmpty() const { return total() == 0; }
    /// Places or buckets, where a container has them; else the number of elements.
    virtual int size() const { return total(); }
    /// The empty value where there is no such index.
    virtual const T& at(int index) const;
    /// The first stored element equal to `value`, or the empty value.
    virtual const T& lookup(const T& value) const;
    virtual bool contains(const T& value) const;
    virtual int occurrences(const T& value) const;
    virtual bool add(const T& value) = 0;
    /// Removes the first element equal to `value`.
    virtual bool remove(const T& value) = 0;
    virtual bool removeAt(int index) = 0;
    virtual void removeAll() = 0;
    /// The caller deletes the iterator.
    virtual TIterator<T>* newIterator() const = 0;
    /// An empty container of the same concrete type, which the caller deletes.
    virtual TContainer* newInstance() const = 0;

    /// What stands for "no element".
    static const T& none()
    {
        static const T value{};
        return value;
    }

protected:
    TContainer() = default;
    TContainer(const TContainer&) = default;
    TContainer& operator=(const TContainer&) = default;
};

template <class T>
int TContainer<T>::total() const
{
    int count = 0;
    for (std::unique_ptr<TIterator<T>> it(newIterator()); !it->done(); it->next())
        count++;
    return count;
}

template <class T>
const T& TContainer<T>::at(int index) const
{
    int position = 0;
    for (std::unique_ptr<TIterator<T>> it(newIterator()); !it->done(); it->next())
        if (position++ == index)
            return it->current();
    return none();
}

template <class T>
const T& TContainer<T>::lookup(const T& value) const
{
    for (std::unique_ptr<TIterator<T>> it(newIterator()); !it->done(); it->next())
        if (it->current() == value)
            return it->current();
    return none();
}

template <class T>
bool TContainer<T>::contains(const T& value) const
{
    for (std::unique_ptr<TIterator<T>> it(newIterator()); !it->done(); it->next())
        if (it->current() == value)
            return true;
    return false;
}

template <class T>
int TContainer<T>::occurrences(const T& value) const
{
    int count = 0;
    for (std::unique_ptr<TIterator<T>> it(newIterator()); !it->done(); it->next())
        if (it->current() == value)
            count++;
    return count;
}
