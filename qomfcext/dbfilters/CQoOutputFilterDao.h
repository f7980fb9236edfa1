// CQoOutputFilterDao - writes the converted records into a table of an
// Access-type database file.
//
// The host sets the table name and the columns (names, types integer or text,
// lengths, indexes) through CQoOutputFilterDB, opens the database with
// UseDB(path) - a missing file becomes a new database - and calls Init, which
// replaces the table by a new one with its indexes and opens it for
// appending; then one InitRow/Value/WriteRow per record and ReleaseFile at the
// end:
//
//     out.SetTableName("Kunden");  out.NumCols(2);  out.ColumnName(0, "Name"); ...
//     out.UseDB("C:\\daten\\ziel.mdb");  out.Init();
//     for each record: out.InitRow(); out.Value(c, text) ...; out.WriteRow();
//     out.ReleaseFile();        // stores the last rows; raises if that fails
//
// A text longer than its column is cut to the column's length. Engine errors
// are raised as CQoException, or shown as message boxes with SetShowError.
// A path that names a file of another kind is refused, never deleted.
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

private:
    CQoOutputFilterDao(const CQoOutputFilterDao&);
    CQoOutputFilterDao& operator=(const CQoOutputFilterDao&);

    bool HasOpenRecordset() const;
    void DiscardRecordset();

    CString m_strPassword;       // ";PWD=..." or empty
    CString m_strConnectPrefix;
    CDaoRecordset* m_pRecordset;
    CDaoDatabase m_database;
    CQoFile* m_pOwnFile;
};
