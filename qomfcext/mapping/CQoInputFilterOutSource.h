// CQoInputFilterOutSource - reads a COutputFilterSource as an input filter.
//
// The rows and columns are those the output would get: the selected columns
// in the user's order, with the source's conversions applied. So the result
// of a mapping can be shown in the input-filter preview lists, or fed to
// anything that reads an input filter.
//
// The filter does not own the source; it only reads it. Without a source it
// has no columns and no rows, and every read leaves its output untouched.
#pragma once

#include <CQoInputFilter.h>

#include "QoMfcExtApi.h"

class COutputFilterSource;

class QOMFCEXT_API CQoInputFilterOutSource : public CQoInputFilter
{
public:
    CQoInputFilterOutSource();
    CQoInputFilterOutSource(const CQoInputFilterOutSource& other);
    CQoInputFilterOutSource& operator=(const CQoInputFilterOutSource& other);

    // --- the input filter -----------------------------------------------------
    virtual void ColName(int col, CQoString& name) override;
    virtual int NumCols() override;
    virtual long NumRows() override;
    // Stands on row 0; false when the source has no rows.
    virtual bool FirstRow() override;
    virtual bool NextRow() override;
    virtual void Value(int col, CQoString& value) override;
    virtual ~CQoInputFilterOutSource();

    // --- the source -----------------------------------------------------------
    // Attaches the source (null detaches) and moves to its first row.
    void SetOutputSource(COutputFilterSource* source);
    COutputFilterSource* GetOutputSource() const { return m_pSource; }

private:
    void SetRow(long row);

    long m_lRow;
    COutputFilterSource* m_pSource;   // not owned
};
