// CQoArray: a growable array with the habits of the family's record model.
//
// Filters hand lists of settings (the field descriptions of a dBase output,
// for example) as CQoArray: a value type that copies its elements, counts and
// indexes with `int`, and raises the index error (CQoException code 19) for a
// position outside the array instead of touching foreign memory.
//
//     CQoArray<CDbaseField> fields;
//     fields.Add(CDbaseField("NAME", 'C', 40));
//     for (int i = 0; i < fields.GetSize(); ++i) use(fields[i]);
#pragma once

#include "CQoException.h"

#include <cstddef>
#include <vector>

// The second parameter names the argument type as the family's interfaces
// spell it (CQoArray<CQoString, CQoString&>, as MFC's CArray does); elements
// are always taken by const reference, so both spellings hold the same data.
template <class T, class ARG_T = T const &>
class CQoArray {
public:
    CQoArray() = default;

    int GetSize() const { return static_cast<int>(m_items.size()); }
    int GetCount() const { return GetSize(); }
    bool IsEmpty() const { return m_items.empty(); }

    // New elements are default-constructed; a negative size counts as 0.
    void SetSize(int size) { m_items.resize(size < 0 ? 0 : static_cast<std::size_t>(size)); }
    void RemoveAll() { m_items.clear(); }

    // Returns the index of the new element.
    int Add(T const &item)
    {
        m_items.push_back(item);
        return GetSize() - 1;
    }

    T const &GetAt(int index) const { return m_items[Checked(index)]; }
    T &ElementAt(int index) { return m_items[Checked(index)]; }
    void SetAt(int index, T const &item) { m_items[Checked(index)] = item; }
    T const &operator[](int index) const { return GetAt(index); }
    T &operator[](int index) { return ElementAt(index); }

    // `index` may equal the size (appends).
    void InsertAt(int index, T const &item)
    {
        if (index < 0 || index > GetSize())
            CQoException::Throw(CQoException::indexError, nullptr);
        m_items.insert(m_items.begin() + index, item);
    }
    void RemoveAt(int index) { m_items.erase(m_items.begin() + static_cast<std::ptrdiff_t>(Checked(index))); }

    std::vector<T> const &Items() const { return m_items; }

private:
    std::size_t Checked(int index) const
    {
        if (index < 0 || index >= GetSize())
            CQoException::Throw(CQoException::indexError, nullptr);
        return static_cast<std::size_t>(index);
    }

    std::vector<T> m_items;
};
