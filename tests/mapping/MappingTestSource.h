// A host's output source for the mapping tests: a table held in memory.
#pragma once

#include <COutputFilterSource.h>

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace mappingtest {

class TableSource : public COutputFilterSource {
public:
    // names: the inner columns; rows: one vector of values per row.
    TableSource(std::vector<std::string> names, std::vector<std::vector<std::string>> rows)
        : m_names(std::move(names)), m_rows(std::move(rows)) {}
    ~TableSource() override { if (m_pDestroyed) *m_pDestroyed = true; }

    void GetSourceValue(long row, int column, CString& value) override
    {
        ++valueCalls;
        lastRow = row;
        if (row < 0 || row >= static_cast<long>(m_rows.size()))
            ADD_FAILURE() << "the host was asked for row " << row << " of " << m_rows.size();
        else
            value = m_rows[row].at(column).c_str();
    }
    void GetSourceName(int column, CString& name, int) override { name = m_names.at(column).c_str(); }
    int NumSourceColumns() override { return static_cast<int>(m_names.size()); }
    long NumSourceRows() override { return static_cast<long>(m_rows.size()); }

    // The host's side changes; the view notices only on InitArray.
    void Rename(int column, const char* name) { m_names.at(column) = name; }
    void AddColumn(const char* name, const char* value)
    {
        m_names.push_back(name);
        for (std::vector<std::string>& row : m_rows) row.push_back(value);
    }
    void AddRow(std::vector<std::string> row) { m_rows.push_back(std::move(row)); }
    void WatchDestruction(bool* flag) { m_pDestroyed = flag; }

    // The names of the entry list, in order; "-" marks an unselected entry.
    std::string Entries()
    {
        std::string out;
        for (int i = 0; i < GetEntryCount(); ++i) {
            CEntry e;
            GetEntry(i, e);
            out += (out.empty() ? "" : ",") + std::string(e.GetSelected() ? "" : "-") + e.GetName().GetString();
        }
        return out;
    }
    // The output columns' names through the output source interface.
    std::string OutputNames()
    {
        std::string out;
        for (int c = 0; c < GetNumColumns(); ++c) {
            CQoString name;
            GetColumnName(c, name);
            out += (c ? "," : "") + std::string(name.GetString());
        }
        return out;
    }

    int valueCalls = 0;
    long lastRow = -1;

private:
    std::vector<std::string> m_names;
    std::vector<std::vector<std::string>> m_rows;
    bool* m_pDestroyed = nullptr;
};

} // namespace mappingtest
