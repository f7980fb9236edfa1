// CInputRecords - the rows of an input filter as an output filter reads them:
// an output source whose inner columns are the filter's columns, so that the
// column view of COutputFilterSource (selection, order, upper case) lies
// between what is read and what is written.
//
// The source moves its filter itself: give it a filter that nothing else
// positions (the program's preview reads its own filter object). A row is
// found by NextRow when it follows the last one read, else by AbsoluteRow;
// a conversion that walks the input itself says where it stands with
// StandsOn, so that no row is looked for twice.
#pragma once

#include <COutputFilterSource.h>
#include <CQoInputFilter.h>

#include <vector>

class CInputRecords : public COutputFilterSource
{
public:
    explicit CInputRecords(CQoInputFilter* filter = nullptr);

    // A new filter (or the same one after new settings): the column view is
    // rebuilt from its columns.
    void SetInputFilter(CQoInputFilter* filter);
    CQoInputFilter* GetInputFilter() const { return m_pFilter; }
    // The filter stands on `row` (-1: on no known row).
    void StandsOn(long row) { m_lRow = row; }
    // For a run that leaves the column view alone: the view is taken once,
    // and a value then goes from the filter straight into the caller's text
    // (no text in between, no walk over the view per value). Any change of
    // the view afterwards needs FreezeView again, or ThawView.
    void FreezeView();
    void ThawView() { m_frozen.clear(); m_bFrozen = false; }
    // A preview needs only the first rows: with a limit the source counts no
    // further (a large file is not read to its end, and a defective record
    // beyond the limit is not met). 0: every row.
    void SetRowLimit(long limit) { m_lRowLimit = limit > 0 ? limit : 0; }

    void GetValue(long row, int col, CQoString& value) override;

    void GetSourceValue(long row, int column, CString& value) override;
    void GetSourceName(int column, CString& name, int flag) override;
    int NumSourceColumns() override;
    long NumSourceRows() override;

private:
    bool MoveTo(long row);

    CQoInputFilter* m_pFilter;
    long m_lRow;
    long m_lRowLimit = 0;
    std::vector<int> m_frozen;   // the filter's column of each output column
    bool m_bFrozen;
};
