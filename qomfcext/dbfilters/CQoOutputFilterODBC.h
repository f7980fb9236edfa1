// CQoOutputFilterODBC - writes the converted records into a table of an ODBC
// data source.
//
// The host sets the table name and the columns (names, types integer or text,
// lengths, indexes) through CQoOutputFilterDB, connects with UseDB(connect
// string) and calls Init, which drops the table, creates it anew with its
// indexes and opens it for appending; then one InitRow/Value/WriteRow per
// record, and ReleaseDB at the end:
//
//     out.SetTableName("Kunden");  out.NumCols(2);  out.ColumnName(0, "Name"); ...
//     out.UseDB("DSN=Ziel");  out.Init();
//     for each record: out.InitRow(); out.Value(c, text) ...; out.WriteRow();
//     out.ReleaseDB();          // stores the last rows; raises if that fails
//
// Rows go to the data source in batches inside transactions. WriteRow answers
// true for a row that is stored or queued; when a batch fails, the error (a
// CQoException, or the message box with SetShowError) names the first row
// that was not stored, every row before it is committed, and no later row is
// taken. Names are put into the SQL unchanged: a name that needs quoting
// comes quoted from the host. Values never enter SQL text.
#pragma once

#include <afxdb.h>

#include <CQoOutputFilterDB.h>

#include "QoMfcExtApi.h"

class CQoODBCRecordset;

class QOMFCEXT_API CQoOutputFilterODBC : public CQoOutputFilterDB
{
public:
    CQoOutputFilterODBC();

    // False without table name or connection; drops and re-creates the table.
    virtual bool Init() override;
    virtual bool WriteRow(CQoString* text = nullptr) override;
    virtual void Value(int col, const CQoString& value) override;
    virtual void InitRow() override;
    virtual ~CQoOutputFilterODBC();
    // Kept by the base only; this filter writes through its own connection.
    virtual void UseDB(CQoDatabase* db) override;
    // Opens the filter's own connection.
    virtual void UseDB(const char* connect) override;
    // Stores what is still queued, then closes the table and the connection.
    virtual void ReleaseDB() override;

protected:
    virtual void CreateIndex();

private:
    CQoOutputFilterODBC(const CQoOutputFilterODBC&);
    CQoOutputFilterODBC& operator=(const CQoOutputFilterODBC&);

    bool HasOpenRecordset() const;
    void DiscardRecordset();
    // Stores the queued rows; the error rule as for WriteRow.
    bool Flush();

    CDatabase m_database;
    CQoODBCRecordset* m_pRecordset;
};
