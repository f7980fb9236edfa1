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

#include <CQoInputFilter.h>

#include "CFreezableSource.h"

class CInputRecords : public CFreezableSource
{
public:
    explicit CInputRecords(CQoInputFilter* filter = nullptr);

    // A new filter (or the same one after new settings): the column view is
    // rebuilt from its columns.
    void SetInputFilter(CQoInputFilter* filter);
    // The filter stands on `row` (-1: on no known row).
    void StandsOn(long row) { m_lRow = row; }
    // A preview needs only the first rows: with a limit the source counts no
    // further (a large file is not read to its end, and a defective record
    // beyond the limit is not met). 0: every row.
    void SetRowLimit(long limit) { m_lRowLimit = limit > 0 ? limit : 0; }

    int NumSourceColumns() override;
    long NumSourceRows() override;

protected:
    void ReadValue(long row, int column, CQoString& value) override;
    void ReadName(int column, CQoString& name) override;

private:
    bool MoveTo(long row);

    CQoInputFilter* m_pFilter;
    long m_lRow;
    long m_lRowLimit = 0;
};
