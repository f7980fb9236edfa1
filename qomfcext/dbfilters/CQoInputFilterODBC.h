// CQoInputFilterODBC - reads a table, or the result of an SQL statement, of an
// ODBC data source as an input filter.
//
// A host constructs it with a connect string (or sets one through Init),
// configures the table (SetTableName/SetTableType, or InitTable on the open
// connection) and reads it like any other input filter:
//
//     CQoInputFilterODBC in("Driver=SQLite3;Database=C:\\daten\\kunden.db");
//     in.SetTableName("Kunden");  in.SetTableType(CQoInputFilterDB::tableTable);
//     in.Init("");                          // connects, runs "select * from Kunden"
//     for (bool ok = in.FirstRow(); ok; ok = in.NextRow()) in.Value(0, text);
//
// Every value arrives as text, whatever the column's type. Connection errors
// are raised as CQoException, except in quiet (batch) mode, where the filter
// stays without connection and reads nothing; errors while moving make the
// move answer false. What was swallowed so is kept in LastError(), so that a
// batch host can name the reason. A table name must be a name and nothing
// else (QoCheckSqlName); a statement is the host's SQL as it stands. The driver's cursor is never held beyond the current
// row: reading keeps memory flat whatever the result's size.
#pragma once

#include <afxdb.h>

#include <CQoInputFilterDB.h>

#include "QoMfcExtApi.h"

class CQoODBCRecordset;

class QOMFCEXT_API CQoInputFilterODBC : public CQoInputFilterDB
{
public:
    CQoInputFilterODBC();
    explicit CQoInputFilterODBC(const char* connect);

    virtual void ColName(int col, CQoString& name) override;
    virtual bool FirstRow() override;
    virtual bool NextRow() override;
    virtual bool AbsoluteRow(long row) override;
    virtual void Value(int col, CQoString& value) override;
    // Connects with `connect` (empty: the connect string kept so far) and,
    // when a table is configured, opens it.
    virtual void Init(const CQoString& connect) override;
    virtual ~CQoInputFilterODBC();

    // The driver's message of the last failure that Init did not raise (the
    // connection in quiet mode) or that a move answered with false; empty
    // after a successful connect.
    const CQoString& LastError() const { return m_strLastError; }
    // The connection, e.g. for the driver's identifier quote.
    CDatabase& GetDatabase() { return m_database; }

protected:
    virtual long CalculateRecordCount() override;

public:
    // Closes the result and the connection (public as in the base: a host
    // that reads the table it replaces closes the input before the output
    // ends).
    virtual void CloseResources() override;
    // Opens a table by name (tableTable) or runs a statement (tableSql) on
    // the open connection; other types change nothing.
    virtual void InitTable(const char* name, tabletype type, bool countRows) override;

private:
    CQoInputFilterODBC(const CQoInputFilterODBC&);
    CQoInputFilterODBC& operator=(const CQoInputFilterODBC&);

    bool HasOpenRecordset() const;

    CDatabase m_database;
    CQoODBCRecordset* m_pRecordset;
    long m_lRow;     // the row the cursor stands on, 0-based
    CQoString m_strLastError;
};
