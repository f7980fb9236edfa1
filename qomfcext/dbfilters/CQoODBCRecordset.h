// CQoODBCRecordset - a recordset that binds every column of any result set as
// text (internal to the library).
//
// The first field exchange learns the result's columns from the open
// statement; from then on each column's value travels through a CString
// buffer, read by the ODBC input filter and written by the ODBC output
// filter. The data source converts numbers and dates to and from text.
// A result has at most maxColumns columns; Open refuses wider ones through
// the filters (TooWide()).
#pragma once

#include <afxdb.h>

class CQoODBCRecordset : public CRecordset
{
    DECLARE_DYNAMIC(CQoODBCRecordset)
public:
    enum { maxColumns = 255, textLength = 255 };

    explicit CQoODBCRecordset(CDatabase* database);
    virtual ~CQoODBCRecordset();

    virtual CString GetDefaultConnect() override;
    virtual CString GetDefaultSQL() override;
    virtual void DoFieldExchange(CFieldExchange* pFX) override;
    virtual void ThrowDBException(RETCODE nRetCode, HSTMT hstmt = SQL_NULL_HSTMT) override;

    int ColumnCount() const { return m_nColumns; }
    // True when the result has more columns than the buffers hold.
    bool TooWide() const { return m_nResultColumns > maxColumns; }
    int ResultColumns() const { return m_nResultColumns; }

    // The current row's value and the name of column i (0 .. ColumnCount()-1).
    CString m_values[maxColumns];
    CString m_names[maxColumns];

private:
    int m_nColumns;          // 0 until the first exchange
    int m_nResultColumns;
    int m_lengths[maxColumns];
};
