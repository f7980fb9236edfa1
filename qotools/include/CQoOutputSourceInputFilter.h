// CQoOutputSourceInputFilter: reads a CQoOutputSource as an input filter.
//
// The rows of the source become the filter's rows, its column names the
// filter's names, so that a preview list or anything else that reads input
// filters can show what an output filter would get. The source is not owned
// and must outlive the filter.
#pragma once

#include "CQoInputFilter.h"

class CQoOutputSource;

class QOTOOLS_API CQoOutputSourceInputFilter : public CQoInputFilter {
public:
    explicit CQoOutputSourceInputFilter(CQoOutputSource *source);

    void SetOutputSource(CQoOutputSource *source);
    CQoOutputSource *GetOutputSource() const { return m_pSource; }

    char const *FileName() const override;
    void ColName(int col, CQoString &name) override;
    int NumCols() override;
    long NumRows() override;
    bool FirstRow() override;
    bool NextRow() override;
    bool AbsoluteRow(long row) override;
    void Value(int col, CQoString &value) override;
    // Nothing to open; only stands before the first row.
    void Init(CQoString const &name) override;
    ~CQoOutputSourceInputFilter() override;

protected:
    // The source's current row count (not cached: a source may change).
    long CalculateRecordCount() override;

private:
    CQoOutputSource *m_pSource;
};
