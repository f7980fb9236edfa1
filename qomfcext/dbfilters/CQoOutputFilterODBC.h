// CQoOutputFilterODBC - writes the converted records into a table of an ODBC
// data source, replacing the table only when the run is complete.
//
// The host sets the table name and the columns (names, types integer or text,
// lengths, indexes) through CQoOutputFilterDB, connects with UseDB(connect
// string) and calls Init; then one InitRow/Value/WriteRow per record, and
// ReleaseDB at the end:
//
//     out.SetTableName("Kunden");  out.NumCols(2);  out.ColumnName(0, "Name"); ...
//     out.UseDB("DSN=Ziel");  out.Init();
//     for each record: out.InitRow(); out.Value(c, text) ...; out.WriteRow();
//     out.ReleaseDB();          // replaces the table; raises if that fails
//
// What the table swap means for a host: Init builds the new table under a
// temporary name beside the target (qo_neu_ and eight hex digits derived from
// the target's name, in the target's schema), removing such a table that a
// killed run left behind; the target itself is not touched. The rows go into
// the new table. ReleaseDB stores the last rows and then, in one transaction,
// drops the old table, renames the new one to the target's name and creates
// the indexes (named after the table and the 1-based column number). Until
// that commit, readers see the old table unchanged, and a reader of the old
// table (the same table in and out) may go on reading while the new one fills,
// as long as it is closed before ReleaseDB. Discard() gives the run up: the
// new table is dropped and the old one stays as it was. A run that fails, is
// given up, or dies leaves the old table exactly as it was; a failed row makes
// ReleaseDB give the run up and say so. The destructor gives the run up while
// an exception unwinds the stack, and otherwise ends it as ReleaseDB does,
// logging a failure instead of raising it.
//
// Rows go to the data source in batches inside transactions. WriteRow answers
// true for a row that is stored or queued; a failure is a CQoException, or
// the message box with SetShowError. Names are put into the SQL as the host
// gives them (quoted in the driver's way if they need it: QoQuoteSqlName with
// GetDatabase().GetIdentifierQuote()), but a name that would be more than a
// name is refused by Init before anything is sent (see QoCheckSqlName).
// Values never enter SQL text; they are stored whole, a NUL byte included
// where the store keeps one (SQLite); elsewhere such a value is refused,
// naming record and column, rather than cut.
#pragma once

#include <afxdb.h>

#include <CQoOutputFilterDB.h>

#include "QoMfcExtApi.h"

class CQoODBCRecordset;

class QOMFCEXT_API CQoOutputFilterODBC : public CQoOutputFilterDB
{
public:
    CQoOutputFilterODBC();

    // False without table name or connection. Refuses names, types and column
    // counts the table cannot have; builds the new table (see above).
    virtual bool Init() override;
    virtual bool WriteRow(CQoString* text = nullptr) override;
    virtual void Value(int col, const CQoString& value) override;
    virtual void InitRow() override;
    virtual ~CQoOutputFilterODBC();
    // Kept by the base only; this filter writes through its own connection.
    virtual void UseDB(CQoDatabase* db) override;
    // Opens the filter's own connection.
    virtual void UseDB(const char* connect) override;
    // Stores what is still queued and puts the new table in the old one's
    // place; then closes the table and the connection.
    virtual void ReleaseDB() override;

    // Gives the run up: the new table is dropped, the old one stays as it
    // was; the table and the connection are closed. Never raises (a table
    // that cannot be dropped is logged, and the next run removes it).
    void Discard();
    // The filter's own connection, e.g. for the driver's identifier quote.
    CDatabase& GetDatabase() { return m_database; }

protected:
    // Creates the indexes of the target table; called inside the transaction
    // that puts the new table in place. A failure raises CDBException, which
    // undoes the whole swap.
    virtual void CreateIndex();

private:
    CQoOutputFilterODBC(const CQoOutputFilterODBC&);
    CQoOutputFilterODBC& operator=(const CQoOutputFilterODBC&);

    bool HasOpenRecordset() const;
    // Refuses what the table cannot have, before anything is sent.
    void CheckDefinition();
    // Closes the recordset; queued rows are no longer wanted.
    void DropRecordset();
    // Drops the new table (if any); false when that failed.
    bool DropNewTable(CQoString* failure);
    // Puts the new table in place; the failure to report, or null.
    CDBException* Complete();
    // The exception's text for this filter's host: where a row failed, and
    // that the target is unchanged.
    CDBException* Unchanged(CDBException* e);
    CDBException* NewFailure(const CQoString& text);

    CDatabase m_database;
    CQoODBCRecordset* m_pRecordset;
    CQoString m_strNewTable;   // the table being filled; empty when none
    bool m_bRowFailed;         // a row was refused: the run cannot end well
    bool m_bKeepsNul;          // the store keeps a NUL inside a text value
    long m_lRows;              // rows handed to WriteRow since Init
};
