// CMultiColumnOutputSource: the output source that CMultiColumnHandler makes in
// its composing type. Its columns are the handler's outer columns; each value is
// composed of the values that the inner columns read from the handler's output
// source, each part preceded by its separator. Internal to qotools; callers see
// a CQoOutputSource.
#pragma once

#include "CQoOutputSource.h"

#include <memory>
#include <string>

struct MultiColumnMapping;

class CMultiColumnOutputSource : public CQoOutputSource {
public:
    explicit CMultiColumnOutputSource(std::shared_ptr<MultiColumnMapping> map);
    ~CMultiColumnOutputSource() override;

    int GetNumColumns() override;
    long GetNumRows() override;
    void GetValue(long row, int col, CQoString &value) override;
    void GetColumnName(int col, CQoString &name) override;
    // The longest value a column can take: the parts' lengths and separators;
    // -1 when a part's length is unknown.
    int GetDataLength(int col) override;

private:
    std::shared_ptr<MultiColumnMapping> m_map;
    std::string m_composed;
};
