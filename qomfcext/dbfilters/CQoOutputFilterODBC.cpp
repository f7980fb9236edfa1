#include "CQoOutputFilterODBC.h"

#include <CQoException.h>
#include <CQoLog.h>

#include "CQoODBCRecordset.h"
#include "QoDbError.h"

CQoOutputFilterODBC::CQoOutputFilterODBC()
    : m_pRecordset(NULL)
{
}

CQoOutputFilterODBC::~CQoOutputFilterODBC()
{
    try {
        ReleaseDB();
    } catch (const CQoException& e) {
        // A destructor cannot raise; the loss is recorded at least.
        _theLog << "ERR: " << e.Message() << CQoLog::endl;
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

void CQoOutputFilterODBC::DiscardRecordset()
{
    if (!m_pRecordset)
        return;
    CQoODBCRecordset* recordset = m_pRecordset;
    m_pRecordset = NULL;
    try {
        if (recordset->IsOpen())
            recordset->Close();
    } catch (CDBException* e) {
        delete recordset;
        QoDbShowOrRaise(e, GetShowError());
        return;
    }
    delete recordset;
}

bool CQoOutputFilterODBC::Flush()
{
    if (!HasOpenRecordset())
        return true;
    try {
        m_pRecordset->FlushBulkAdd();
    } catch (CDBException* e) {
        return QoDbShowOrRaise(e, GetShowError());
    }
    return true;
}

void CQoOutputFilterODBC::ReleaseDB()
{
    // The queued rows first: their failure must reach the host, not vanish
    // with the recordset.
    bool stored = true;
    CQoString failure;
    try {
        stored = Flush();
    } catch (const CQoException& e) {
        stored = false;
        failure = e.Message();
    }
    try {
        DiscardRecordset();
    } catch (const CQoException&) {
        // the flush's error is the one to report
    }
    if (m_database.IsOpen())
        m_database.Close();
    CQoOutputFilterDB::ReleaseDB();
    if (!failure.IsEmpty())
        CQoException::Throw(failure, nullptr);
    (void)stored;
}

bool CQoOutputFilterODBC::Init()
{
    if (m_strTableName.IsEmpty() || !m_database.IsOpen())
        return false;
    // Columns the table cannot have are refused before the old table is
    // dropped: a create statement that must fail would only lose it.
    if (NumCols() > CQoODBCRecordset::maxColumns) {
        CQoString text;
        text.Format("Die Tabelle %s h\xE4tte %d Spalten; h\xF6" "chstens %d sind m\xF6glich.",
                    m_strTableName.GetString(), NumCols(), (int)CQoODBCRecordset::maxColumns);
        CQoException::Throw(text, nullptr);
    }
    for (int i = 0; i < NumCols(); ++i) {
        int type = GetType(i);
        if (type != dbtypeInteger && type != dbtypeText) {
            CQoString name, text;
            GetColumnName(i, name);
            text.Format("Spalte %s: unbekannter Datentyp %d", name.GetString(), type);
            CQoException::Throw(text, nullptr);
        }
    }
    DiscardRecordset();

    CString sql;
    sql.Format("drop table %s", m_strTableName.GetString());
    try {
        m_database.ExecuteSQL(sql);
    } catch (CDBException* e) {
        e->Delete();   // there may be no such table yet
    }

    sql = "create table ";
    sql += m_strTableName.GetString();
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
        QoDbShowOrRaise(e, GetShowError());
        return true;
    }

    CreateIndex();

    try {
        m_pRecordset = new CQoODBCRecordset(&m_database);
        sql.Format("select * from %s", m_strTableName.GetString());
        m_pRecordset->Open(CRecordset::snapshot, sql, CRecordset::appendOnly | CRecordset::optimizeBulkAdd);
    } catch (CDBException* e) {
        delete m_pRecordset;
        m_pRecordset = NULL;
        QoDbShowOrRaise(e, GetShowError());
    }
    return true;
}

void CQoOutputFilterODBC::CreateIndex()
{
    if (!m_database.IsOpen())
        return;
    try {
        for (int i = 0; i < NumCols(); ++i) {
            if (!GetIndexed(i))
                continue;
            CQoString name;
            GetColumnName(i, name);
            CString sql;
            sql.Format("create index %s%d on %s(%s)", m_strTableName.GetString(), i + 1,
                       m_strTableName.GetString(), name.GetString());
            m_database.ExecuteSQL(sql);
        }
    } catch (CDBException* e) {
        QoDbShowOrRaise(e, GetShowError());
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
        QoDbShowOrRaise(e, GetShowError());
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
    m_pRecordset->m_values[col] = value.GetString();
}

bool CQoOutputFilterODBC::WriteRow(CQoString*)
{
    if (!m_database.IsOpen() || !HasOpenRecordset())
        return false;
    try {
        return m_pRecordset->Update() != FALSE;
    } catch (CDBException* e) {
        return QoDbShowOrRaise(e, GetShowError());
    }
}
