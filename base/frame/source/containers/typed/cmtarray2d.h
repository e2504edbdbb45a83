#pragma once

#include <cstddef>
#include <vector>

/// A table of rows and columns whose entries are all empty values at first. One thread at a time.
template <class T>
class CmTArray2D
{
public:
    CmTArray2D(unsigned rowCount, unsigned columnCount)
        : rows(rowCount),
          columns(columnCount),
          entries(static_cast<std::size_t>(rowCount) * columnCount)
    {
    }

    unsigned countRows() const { return rows; }
    unsigned countColumns() const { return columns; }
    /// Both must be in range.
    T& at(unsigned row, unsigned column) { return entries[place(row, column)]; }
    const T& at(unsigned row, unsigned column) const { return entries[place(row, column)]; }

private:
    std::size_t place(unsigned row, unsigned column) const
    {
        return static_cast<std::size_t>(row) * columns + column;
    }

    unsigned rows;
    unsigned columns;
    std::vector<T> entries;
};
