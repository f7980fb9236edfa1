// CMultiColumnInputFilter: the input filter that CMultiColumnHandler makes in
// its splitting type. It reads the handler's read filter and delivers the inner
// columns: each one the part of its outer column's value that the assignments
// give it. Internal to qotools; callers see a CQoInputFilter.
#pragma once

#include "CQoInputFilter.h"

#include <memory>
#include <string>
#include <vector>

struct MultiColumnMapping;

class CMultiColumnInputFilter : public CQoInputFilter {
public:
    explicit CMultiColumnInputFilter(std::shared_ptr<MultiColumnMapping> map);

    char const *FileName() const override;
    void ColName(int col, CQoString &name) override;
    // Renames the inner column (the handler's name of it).
    void SetColName(int col, CQoString const &name) override;
    int NumCols() override;
    long NumRows() override;
    bool FirstRow() override;
    bool NextRow() override;
    bool AbsoluteRow(long row) override;
    void Value(int col, CQoString &value) override;
    // Opens the read filter anew on `name`.
    void Init(CQoString const &name) override;
    ~CMultiColumnInputFilter() override;
    // This filter has no configuration page of its own: filterUnknown.
    int InputFilterType() const override;
    bool StartDescription(CQoString &line) override;
    // The mapping, as CMultiColumnHandler::WriteConfig / ReadConfig store it.
    void WriteConfig(CQoConfigFile &cfg, CQoString const &section) override;
    void ReadConfig(CQoConfigFile &cfg, CQoString const &section) override;
    bool GetFirstRowHasNames() const override;
    void LoadColumnNames() override;
    bool CreateIndexFile() override;
    void NoCache(bool noCache) override;
    long long getActPosInFile() override;

protected:
    long CalculateRecordCount() override;

private:
    // Where each inner column's value comes from, rebuilt when the mapping changes.
    struct Source {
        int outer = -1; // outer column index, -1: not assigned
        int part = 0;   // the part's place among the outer column's parts
    };
    void Prepare();
    bool Moved(bool ok);

    std::shared_ptr<MultiColumnMapping> m_map;
    unsigned long m_preparedVersion;
    std::vector<Source> m_sources;
    // Values of the current row, split once per outer column.
    std::vector<std::vector<std::string>> m_split;
    std::vector<bool> m_splitDone;
    std::string m_outerValue;
};
