// Table data for the multi-column handler's tests: an input filter and an
// output source that hold their rows in memory, built on the real base classes.
#pragma once

#include "CQoInputFilter.h"
#include "CQoOutputSource.h"

#include <string>
#include <vector>

typedef std::vector<std::vector<std::string>> Rows;

class MemoryInputFilter : public CQoInputFilter {
public:
    MemoryInputFilter(std::vector<std::string> const &names, Rows rows) : m_rows(std::move(rows))
    {
        SetNumColsInternal(static_cast<int>(names.size()));
        for (std::size_t c = 0; c < names.size(); ++c)
            m_colNames[c] = names[c].c_str();
        m_strFileName = "memory";
    }
    bool FirstRow() override { return AbsoluteRow(0); }
    bool NextRow() override { return m_lCurrentRow >= 0 && AbsoluteRow(m_lCurrentRow + 1); }
    bool AbsoluteRow(long row) override
    {
        if (row < 0 || row >= static_cast<long>(m_rows.size())) {
            m_lCurrentRow = -1;
            return false;
        }
        m_lCurrentRow = row;
        return true;
    }
    void Value(int col, CQoString &value) override
    {
        value.Empty();
        if (m_lCurrentRow >= 0 && col >= 0 && col < static_cast<int>(m_rows[m_lCurrentRow].size()))
            value = m_rows[m_lCurrentRow][col].c_str();
    }
    Rows m_rows;

protected:
    long CalculateRecordCount() override { return static_cast<long>(m_rows.size()); }
};

class MemoryOutputSource : public CQoOutputSource {
public:
    MemoryOutputSource(std::vector<std::string> names, Rows rows, std::vector<int> lengths = {})
        : m_names(std::move(names)), m_rows(std::move(rows)), m_lengths(std::move(lengths))
    {
    }
    int GetNumColumns() override { return static_cast<int>(m_names.size()); }
    long GetNumRows() override { return static_cast<long>(m_rows.size()); }
    void GetValue(long row, int col, CQoString &value) override
    {
        value.Empty();
        if (row >= 0 && row < GetNumRows() && col >= 0 && col < static_cast<int>(m_rows[row].size()))
            value = m_rows[row][col].c_str();
    }
    void GetColumnName(int col, CQoString &name) override
    {
        name.Empty();
        if (col >= 0 && col < GetNumColumns())
            name = m_names[col].c_str();
    }
    int GetDataLength(int col) override
    {
        return col >= 0 && col < static_cast<int>(m_lengths.size()) ? m_lengths[col] : -1;
    }
    std::vector<std::string> m_names;
    Rows m_rows;
    std::vector<int> m_lengths;
};
