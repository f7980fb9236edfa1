#include "CQoOutputFilterODBC.h"

#include <CQoException.h>
#include <CQoLog.h>

#include <cstring>
#include <exception>

#include "CQoODBCRecordset.h"
#include "QoDbError.h"
#include "QoSqlName.h"

namespace {

// A name as a message shows it: on one line whatever it holds.
CQoString Shown(const CQoString& name)
{
    CQoString shown;
    for (int i = 0; i < name.GetLength(); ++i) {
        unsigned char c = (unsigned char)name.GetString()[i];
        shown += (c < 0x20 || c == 0x7F) ? '?' : (char)c;
    }
    return shown;
}

// The table a run fills before it takes the target's place: beside the
// target, named after it, so that the next run of the same target finds and
// removes what a killed run left behind.
CQoString NewTableName(const CQoString& target)
{
    return target.Left(QoSqlNameLastPart(target)) + QoRunTableName(target);
}

// The index of a column: the table's own name and the column's number, in
// the table's quote if it has one.
CQoString IndexName(const CQoString& table, int number)
{
    CQoString last = table.Mid(QoSqlNameLastPart(table));
    CQoString digits;
    digits.Format("%d", number);
    int n = last.GetLength();
    char c = n > 1 ? last.GetString()[n - 1] : '\0';
    if (c == '"' || c == '`' || c == ']')
        return last.Left(n - 1) + digits + c;
    return last + digits;
}

} // namespace

CQoOutputFilterODBC::CQoOutputFilterODBC()
    : m_pRecordset(NULL), m_bRowFailed(false), m_bKeepsNul(false), m_lRows(0)
{
}

CQoOutputFilterODBC::~CQoOutputFilterODBC()
{
    // While an exception unwinds the stack the run was not finished: the
    // host's exception is the report, and the old table must stay.
    if (!m_strNewTable.IsEmpty() && std::uncaught_exceptions() > 0) {
        Discard();
        return;
    }
    try {
        ReleaseDB();
    } catch (const CQoException& e) {
        // A destructor cannot raise; the failure is recorded, on one line.
        CQoString text = e.Message();
        text.Replace("\r", "");
        text.Replace("\n", " ");
        _theLog << "ERR: " << text.GetString() << CQoLog::endl;
    }
}

bool CQoOutputFilterODBC::HasOpenRecordset() const
{
    return m_pRecordset && m_pRecordset->IsOpen();
}

void CQoOutputFilterODBC::UseDB(CQoDatabase* db)
{
    CQoOutputFilterDB::UseDB(db);
}

void CQoOutputFilterODBC::UseDB(const char* connect)
{
    CQoOutputFilterDB::UseDB(connect);
    try {
        m_database.OpenEx(connect ? connect : "", CDatabase::useCursorLib);
    } catch (CDBException* e) {
        QoDbRaise(e);
    }
}

CDBException* CQoOutputFilterODBC::NewFailure(const CQoString& text)
{
    CDBException* e = new CDBException(SQL_ERROR);
    e->m_strError = text.GetString();
    return e;
}

CDBException* CQoOutputFilterODBC::Unchanged(CDBException* e)
{
    CString text = e->m_strError;
    if (e->m_lFirstRowNotStored >= 0) {
        // The recordset counts what it stored in the new table, which is
        // dropped now: the host needs the records to look at instead.
        int note = text.ReverseFind('\n');
        if (note >= 0)
            text = text.Left(note);
        CString where;
        long first = e->m_lFirstRowNotStored + 1;
        if (first >= m_lRows)
            where.Format(" (Datensatz %ld)", m_lRows);
        else
            where.Format(" (Datensatz %ld bis %ld)", first, m_lRows);
        text += where;
    }
    text.TrimRight(" \r\n.");
    CString unchanged;
    unchanged.Format(". Die Tabelle %s ist unver\xE4ndert.", Shown(m_strTableName).GetString());
    e->m_strError = text + unchanged;
    return e;
}

void CQoOutputFilterODBC::CheckDefinition()
{
    CQoString problem, text;
    if (!QoCheckSqlName(m_strTableName, problem)) {
        text.Format("Der Tabellenname \x84%s\x93 %s.", Shown(m_strTableName).GetString(), problem.GetString());
        CQoException::Throw(text, nullptr);
    }
    if (NumCols() > CQoODBCRecordset::maxColumns) {
        text.Format("Die Tabelle %s h\xE4tte %d Spalten; h\xF6" "chstens %d sind m\xF6glich.",
                    m_strTableName.GetString(), NumCols(), (int)CQoODBCRecordset::maxColumns);
        CQoException::Throw(text, nullptr);
    }
    for (int i = 0; i < NumCols(); ++i) {
        CQoString name;
        GetColumnName(i, name);
        if (!QoCheckSqlName(name, problem)) {
            text.Format("Der Spaltenname \x84%s\x93 (Spalte %d) %s.", Shown(name).GetString(), i + 1,
                        problem.GetString());
            CQoException::Throw(text, nullptr);
        }
        int type = GetType(i);
        if (type != dbtypeInteger && type != dbtypeText) {
            text.Format("Spalte %s: unbekannter Datentyp %d", name.GetString(), type);
            CQoException::Throw(text, nullptr);
        }
    }
}

void CQoOutputFilterODBC::DropRecordset()
{
    if (!m_pRecordset)
        return;
    CQoODBCRecordset* recordset = m_pRecordset;
    m_pRecordset = NULL;
    try {
        if (recordset->IsOpen())
            recordset->Close();
    } catch (CDBException* e) {
        e->Delete();   // rows of a table that is given up
    }
    delete recordset;
}

bool CQoOutputFilterODBC::DropNewTable(CQoString* failure)
{
    DropRecordset();
    if (m_strNewTable.IsEmpty())
        return true;
    CQoString table = m_strNewTable;
    m_strNewTable.Empty();
    if (!m_database.IsOpen()) {
        if (failure)
            failure->Format("Die Tabelle %s bleibt zur\xFC" "ck, die Verbindung ist geschlossen; der n\xE4" "chste Lauf "
                            "entfernt sie.", table.GetString());
        return false;
    }
    try {
        m_database.ExecuteSQL(CString("drop table if exists ") + table.GetString());
    } catch (CDBException* e) {
        if (failure)
            failure->Format("Die Tabelle %s konnte nicht entfernt werden: %s", table.GetString(),
                            QoDbTakeMessage(e).GetString());
        else
            e->Delete();
        return false;
    }
    return true;
}

void CQoOutputFilterODBC::Discard()
{
    CQoString failure;
    if (!DropNewTable(&failure)) {
        failure.Replace("\n", " ");
        _theLog << "ERR: " << failure.GetString() << CQoLog::endl;
    }
    m_bRowFailed = false;
    if (m_database.IsOpen())
        m_database.Close();
    CQoOutputFilterDB::ReleaseDB();
}

CDBException* CQoOutputFilterODBC::Complete()
{
    if (!m_database.IsOpen()) {
        CQoString failure;
        DropNewTable(&failure);
        return NewFailure(CQoString("Die Verbindung zur Datenbank ist geschlossen. ") + failure);
    }
    if (m_bRowFailed) {
        DropNewTable(nullptr);
        return Unchanged(NewFailure("Ein Datensatz wurde nicht gespeichert"));
    }
    // The last rows first: their failure must reach the host, not vanish
    // with the recordset.
    try {
        if (HasOpenRecordset())
            m_pRecordset->FlushBulkAdd();
    } catch (CDBException* e) {
        DropNewTable(nullptr);
        return Unchanged(e);
    }
    DropRecordset();

    // One transaction, so that nobody ever sees the target missing or half
    // made; PostgreSQL keeps index names per schema, so the indexes are made
    // after the old table and its indexes are gone.
    bool transaction = m_database.CanTransact() && m_database.BeginTrans();
    try {
        m_database.ExecuteSQL(CString("drop table if exists ") + m_strTableName.GetString());
        CQoString target = m_strTableName.Mid(QoSqlNameLastPart(m_strTableName));
        m_database.ExecuteSQL(CString("alter table ") + m_strNewTable.GetString() + " rename to "
                              + target.GetString());
        CreateIndex();
        if (transaction)
            m_database.CommitTrans();
    } catch (CDBException* e) {
        if (transaction) {
            try {
                m_database.Rollback();
            } catch (CDBException* rollback) {
                rollback->Delete();   // the first failure is the one to report
            }
        }
        DropNewTable(nullptr);
        return Unchanged(e);
    }
    m_strNewTable.Empty();
    return nullptr;
}

void CQoOutputFilterODBC::ReleaseDB()
{
    CDBException* failure = m_strNewTable.IsEmpty() ? nullptr : Complete();
    DropRecordset();
    m_bRowFailed = false;
    if (m_database.IsOpen())
        m_database.Close();
    CQoOutputFilterDB::ReleaseDB();
    if (failure)
        QoDbShowOrRaise(failure, GetShowError());
}

bool CQoOutputFilterODBC::Init()
{
    if (m_strTableName.IsEmpty() || !m_database.IsOpen())
        return false;
    // Everything the table cannot have is refused first: nothing is sent.
    CheckDefinition();
    DropNewTable(nullptr);   // an unfinished earlier run of this filter
    m_bRowFailed = false;
    m_lRows = 0;

    // What a killed run of the same target left behind.
    CQoString table = NewTableName(m_strTableName);
    try {
        m_database.ExecuteSQL(CString("drop table if exists ") + table.GetString());
    } catch (CDBException* e) {
        e->Delete();   // then the create below says what stands in the way
    }

    CString sql = "create table ";
    sql += table.GetString();
    sql += " (";
    for (int i = 0; i < NumCols(); ++i) {
        CQoString name;
        GetColumnName(i, name);
        CString column;
        if (GetType(i) == dbtypeInteger)
            column.Format("%s integer", name.GetString());
        else
            column.Format("%s varchar(%d)", name.GetString(), GetLength(i));
        sql += column;
        if (i < NumCols() - 1)
            sql += ", ";
    }
    sql += ")";
    try {
        m_database.ExecuteSQL(sql);
    } catch (CDBException* e) {
        QoDbShowOrRaise(Unchanged(e), GetShowError());
        return true;
    }
    m_strNewTable = table;
    // SQLite keeps text by length; other stores end text at a NUL.
    CString dbms = m_database.GetDatabaseName();
    dbms.MakeLower();
    m_bKeepsNul = dbms.Find("sqlite") >= 0;

    try {
        m_pRecordset = new CQoODBCRecordset(&m_database);
        sql.Format("select * from %s", table.GetString());
        m_pRecordset->Open(CRecordset::snapshot, sql, CRecordset::appendOnly | CRecordset::optimizeBulkAdd);
    } catch (CDBException* e) {
        DropNewTable(nullptr);
        QoDbShowOrRaise(Unchanged(e), GetShowError());
    }
    return true;
}

void CQoOutputFilterODBC::CreateIndex()
{
    if (!m_database.IsOpen())
        return;
    for (int i = 0; i < NumCols(); ++i) {
        if (!GetIndexed(i))
            continue;
        CQoString name;
        GetColumnName(i, name);
        CString sql;
        sql.Format("create index %s on %s(%s)", IndexName(m_strTableName, i + 1).GetString(),
                   m_strTableName.GetString(), name.GetString());
        m_database.ExecuteSQL(sql);
    }
}

void CQoOutputFilterODBC::InitRow()
{
    CQoOutputFilter::InitRow();
    if (!m_database.IsOpen() || !HasOpenRecordset())
        return;
    try {
        m_pRecordset->AddNew();
    } catch (CDBException* e) {
        m_bRowFailed = true;
        QoDbShowOrRaise(Unchanged(e), GetShowError());
    }
}

void CQoOutputFilterODBC::Value(int col, const CQoString& value)
{
    if (!m_database.IsOpen() || !HasOpenRecordset())
        return;
    if (col < 0 || col >= m_pRecordset->ColumnCount()) {
        CQoString where;
        where.Format("Spalte %d", col);
        CQoException::Throw(CQoException::indexError, where);
    }
    // By length: a NUL inside the value is part of it. A store that cannot
    // hold one (its driver would cut the value there) refuses the value.
    if (!m_bKeepsNul && std::memchr(value.GetString(), '\0', (std::size_t)value.GetLength()) != nullptr) {
        CQoString name, text;
        GetColumnName(col, name);
        text.Format("Datensatz %ld, Spalte %s: der Wert enth\xE4lt ein NUL-Zeichen, das diese Datenbank nicht "
                    "speichern kann.", m_lRows + 1, Shown(name).GetString());
        m_bRowFailed = true;
        QoDbShowOrRaise(Unchanged(NewFailure(text)), GetShowError());
        return;
    }
    m_pRecordset->m_values[col] = CString(value.GetString(), value.GetLength());
}

bool CQoOutputFilterODBC::WriteRow(CQoString*)
{
    if (!m_database.IsOpen() || !HasOpenRecordset())
        return false;
    ++m_lRows;
    if (m_bRowFailed)
        return false;   // the run is lost already; its report has been given
    try {
        return m_pRecordset->Update() != FALSE;
    } catch (CDBException* e) {
        m_bRowFailed = true;
        return QoDbShowOrRaise(Unchanged(e), GetShowError());
    }
}
