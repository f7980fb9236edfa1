// CColumnView - the columns that a conversion writes, in the order written:
// a COutputFilterSource over the composed columns (one per output column of
// the mapping), whose entry list the user edits on the output source page.
//
// Sync() lays the entry list over the composed columns as they are now and
// keeps what the user chose: columns are recognised by their name, keep
// their place and tick, and a column that is new is appended ticked. So a
// stored selection survives a changed mapping, and a column renamed in the
// mapping simply comes back as a new one.
#pragma once

#include <utility>
#include <vector>

#include "CFreezableSource.h"

class CQoOutputSource;

class CColumnView : public CFreezableSource
{
public:
    // A column's name and whether it is written, in output order.
    typedef std::vector<std::pair<CString, bool>> Selection;

    explicit CColumnView(CQoOutputSource* composed = nullptr);

    void SetComposed(CQoOutputSource* composed) { m_pComposed = composed; ThawView(); }
    // The entry list anew over the composed columns; `wanted` says the
    // order and ticks of the columns it names (see above).
    void Sync(const Selection& wanted);
    // The entry list as it stands (built first if it never was).
    Selection GetSelection();

    int NumSourceColumns() override;
    long NumSourceRows() override;

protected:
    void ReadValue(long row, int column, CQoString& value) override;
    void ReadName(int column, CQoString& name) override;

private:
    CQoOutputSource* m_pComposed;   // not owned
};
