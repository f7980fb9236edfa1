// CQoOutputFilterDao - writes the converted records into a table of an
// Access-type database file.
//
// The host sets the table name and the columns (names, types integer or text,
// lengths, indexes) through CQoOutputFilterDB, opens the database with
// UseDB(path) - a missing file becomes a new database - and calls Init; then
// one InitRow/Value/WriteRow per record and ReleaseFile at the end:
//
//     out.SetTableName("Kunden");  out.NumCols(2);  out.ColumnName(0, "Name"); ...
//     out.UseDB("C:\\daten\\ziel.mdb");  out.Init();
//     for each record: out.InitRow(); out.Value(c, text) ...; out.WriteRow();
//     out.ReleaseFile();        // puts the new table in place; raises if that fails
//
// The old table is replaced only by a complete new one. Init checks the
// definition (names, types, column count) and builds the new table under a
// temporary name (qo_neu_ and a hash of the table name); the rows go there.
// ReleaseFile, ReleaseDB or the destructor then drop the old table, give the
// new one its name and make its indexes, in one transaction. Until then the
// old table is untouched, and stays so when anything fails: a definition the
// engine refuses, a row that could not be written (the end step then reports
// the table unchanged), the host giving up (Discard), an exception unwinding
// through the destructor, or a killed process, whose leftover table the next
// run on that table drops. For a host this means: a reader of the old table
// sees it whole until the run ends, and needs as much room again in the file.
//
// A text longer than its column is cut to the column's length; a value
// holding a NUL character is refused. Errors name the record (counted from 1
// as the host writes them) and the column. Engine errors are raised as
// CQoException, or shown as message boxes with SetShowError. A path that
// names a file of another kind is refused, never deleted; one that cannot
// hold a database (a missing folder, a folder, a device, a network path, one
// too long) is refused before anything is made. In batch mode a database
// protected by a password is not asked for: the filter stays closed and
// LastError says why.
#pragma once

#include <afxdao.h>

#include <CQoFile.h>
#include <CQoOutputFilterDB.h>

#include "QoMfcExtApi.h"

class QOMFCEXT_API CQoOutputFilterDao : public CQoOutputFilterDB
{
public:
    explicit CQoOutputFilterDao(CQoFile::fileType type = CQoFile::typeAccess);

    virtual bool Init() override;
    virtual bool WriteRow(CQoString* text = nullptr) override;
    virtual void Value(int col, const CQoString& value) override;
    virtual void InitRow() override;
    virtual ~CQoOutputFilterDao();
    // Opens the database whose path is the file's name; the flag is unused.
    virtual void UseFile(CQoFile* file, bool closeOnRelease) override;
    // Closes the table (storing what is queued) and the database.
    virtual void ReleaseFile() override;
    // "table", "columns", "column<i>_name/_type/_len/_index"; never the password.
    virtual void WriteConfig(CQoConfigFile& cfg, const CQoString& section) override;
    virtual void ReadConfig(CQoConfigFile& cfg, const CQoString& section) override;
    using CQoOutputFilterDB::UseDB;
    // Opens (or, for a missing or empty file, creates) the database at `path`.
    virtual void UseDB(const char* path) override;
    virtual void ReleaseDB() override;

    // The password for the next open; empty clears it.
    void Password(const CQoString& password);

    // Gives up the run: the new table is dropped, the old one stays as it
    // was, and the table and the database are closed as ReleaseFile does.
    // Never raises (a table it cannot drop is logged; the next run drops it).
    void Discard();
    // Why the last open failed or was cancelled; empty after a successful open.
    const CQoString& LastError() const { return m_strLastError; }

private:
    CQoOutputFilterDao(const CQoOutputFilterDao&);
    CQoOutputFilterDao& operator=(const CQoOutputFilterDao&);

    bool HasOpenRecordset() const;
    void DiscardRecordset();
    void CheckPath(const char* path);
    void DefineTable(CDaoTableDef& table);
    void DropTable(const CString& name);
    void Finish();
    void AbandonRun();
    bool Fail(CDaoException* e, int col);
    void Refuse(CDaoException* e);

    CString m_strPassword;       // ";PWD=..." or empty
    CString m_strConnectPrefix;
    CDaoRecordset* m_pRecordset;
    // A workspace of its own: the swap's transaction covers this database
    // only, not others the host has open.
    CDaoWorkspace m_workspace;
    CDaoDatabase m_database;
    CQoFile* m_pOwnFile;
    CString m_strNewTable;       // the unfinished run's table; empty when none
    CString m_strTarget;         // the table it is to replace
    bool m_bRowFailed;           // a row of the run was not stored
    long m_lRecord;              // the record being written, from 1
    CQoString m_strLastError;
};
