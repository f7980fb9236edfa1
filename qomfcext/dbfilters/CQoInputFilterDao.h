// CQoInputFilterDao - reads a table, a stored query or the result of an SQL
// statement of a file database (an Access-type database, an .mdb file, an
// Excel workbook) as an input filter.
//
//     CQoInputFilterDao in(CQoFile::typeAccess);
//     in.SetTableName("Kunden");  in.SetTableType(CQoInputFilterDB::tableTable);
//     in.Init("C:\\daten\\kunden.mdb");     // asks for the password if there is one
//     for (bool ok = in.FirstRow(); ok; ok = in.NextRow()) in.Value(0, text);
//
// Every value becomes text by ConvertOleVariant. A database protected by a
// password is opened after the user typed it in CQoPasswortDlg (asked again
// until it fits or the user cancels). In batch mode nobody is asked: a
// missing or wrong password (give it with Password) leaves the filter closed
// with a log line. Other errors while opening are raised as CQoException,
// except in quiet (batch) mode, where the filter stays closed and reads
// nothing; LastError then tells the host why. Errors while selecting a table
// are always raised; errors while moving make the move answer false.
#pragma once

#include <afxdao.h>

#include <CQoFile.h>
#include <CQoInputFilterDB.h>

#include "QoMfcExtApi.h"

class QOMFCEXT_API CQoInputFilterDao : public CQoInputFilterDB
{
public:
    explicit CQoInputFilterDao(CQoFile::fileType type);
    CQoInputFilterDao();

    virtual const char* FileName() const override;
    virtual void ColName(int col, CQoString& name) override;
    virtual bool FirstRow() override;
    virtual bool NextRow() override;
    virtual bool AbsoluteRow(long row) override;
    virtual void Value(int col, CQoString& value) override;
    // Opens the database file `name` (Algorithms in the header's opening).
    virtual void Init(const CQoString& name) override;
    virtual ~CQoInputFilterDao();
    // Keys "database", "table", "tabletype", "filetype"; never the password.
    virtual void WriteConfig(CQoConfigFile& cfg, const CQoString& section) override;
    virtual void ReadConfig(CQoConfigFile& cfg, const CQoString& section) override;

    virtual void CloseResources() override;
    virtual void InitTable(const char* name, tabletype type, bool countRows) override;

    // The password for the next open; empty clears it. The getter answers
    // ";PWD=" with the password, or empty.
    void Password(const CQoString& password);
    const CQoString& Password() const { return m_strPassword; }
    CDaoDatabase& GetDatabase() { return m_database; }
    // Why the last Init left the database closed (the engine's description,
    // the password or the workbook message); empty after a successful open.
    const CQoString& LastError() const { return m_strLastError; }
    void SetShowError(bool show) { m_bShowError = show; }

    // The text of a field value: numbers, dates, currency, booleans and
    // bytes as text, the names of types that hold no text.
    static void ConvertOleVariant(const COleVariant& value, CQoString& out);

protected:
    virtual long CalculateRecordCount() override;
    virtual bool CloseFile() override;

private:
    CQoInputFilterDao(const CQoInputFilterDao&);
    CQoInputFilterDao& operator=(const CQoInputFilterDao&);

    bool OpenRecordSet();
    void DeleteObjects();

    CDaoQueryDef* m_pQueryDef;
    CDaoRecordset* m_pRecordset;
    CQoString m_strPassword;     // ";PWD=..." or empty
    CQoString m_strConnectPrefix;
    CQoString m_strLastError;
    CDaoTableDef* m_pTableDef;
    CDaoDatabase m_database;
    bool m_bShowError;
    int m_nFileType;
};
