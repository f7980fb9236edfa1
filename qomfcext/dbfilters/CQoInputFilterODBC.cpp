#include "CQoInputFilterODBC.h"

#include <CQoException.h>
#include <CQoInterActive.h>

#include "CQoODBCRecordset.h"
#include "QoDbError.h"
#include "QoSqlName.h"

CQoInputFilterODBC::CQoInputFilterODBC()
    : m_pRecordset(NULL), m_lRow(0)
{
}

CQoInputFilterODBC::CQoInputFilterODBC(const char* connect)
    : m_pRecordset(NULL), m_lRow(0)
{
    m_strDatabaseName = connect ? connect : "";
}

CQoInputFilterODBC::~CQoInputFilterODBC()
{
    CloseResources();
}

bool CQoInputFilterODBC::HasOpenRecordset() const
{
    return m_pRecordset && m_pRecordset->IsOpen();
}

void CQoInputFilterODBC::Init(const CQoString& connect)
{
    if (!connect.IsEmpty())
        m_strDatabaseName = connect;
    CloseResources();
    CQoInputFilter::Init(m_strDatabaseName);
    m_strLastError.Empty();
    try {
        m_database.OpenEx(m_strDatabaseName, CDatabase::useCursorLib);
    } catch (CDBException* e) {
        CQoString text = QoDbTakeMessage(e);
        // A batch run goes on without the source; its reads find nothing,
        // and the host can still say why.
        if (!CQoInterActive::IsQuiet())
            CQoException::Throw(text, nullptr);
        m_strLastError = text;
    }
    if (!m_strTableName.IsEmpty() && m_tableType != tableNone)
        InitTable(m_strTableName, m_tableType, true);
}

void CQoInputFilterODBC::InitTable(const char* name, tabletype type, bool countRows)
{
    if (!m_database.IsOpen())
        return;
    CString statement;
    if (type == tableTable) {
        CQoString problem;
        if (!QoCheckSqlName(name ? name : "", problem)) {
            CQoString text;
            text.Format("Der Tabellenname \x84%s\x93 %s.", name ? name : "", problem.GetString());
            text.Replace('\n', ' ');
            text.Replace('\r', ' ');
            CQoException::Throw(text, nullptr);
        }
        statement.Format("select * from %s", name);
    } else if (type == tableSql) {
        statement = name ? name : "";
        statement.Trim();
        if (statement.IsEmpty())
            CQoException::Throw("Die Eingabe enth\xE4lt keine SQL-Anweisung.", nullptr);
    } else {
        return;
    }

    delete m_pRecordset;
    m_pRecordset = NULL;
    try {
        m_pRecordset = new CQoODBCRecordset(&m_database);
        m_pRecordset->Open(CRecordset::snapshot, statement, CRecordset::readOnly);
    } catch (CDBException* e) {
        delete m_pRecordset;
        m_pRecordset = NULL;
        SetNumColsInternal(0);
        QoDbRaise(e);
    }
    if (m_pRecordset->TooWide()) {
        CQoString text;
        text.Format("Das Ergebnis hat %d Spalten; gelesen werden h\xF6" "chstens %d.",
                    m_pRecordset->ResultColumns(), (int)CQoODBCRecordset::maxColumns);
        delete m_pRecordset;
        m_pRecordset = NULL;
        SetNumColsInternal(0);
        CQoException::Throw(text, nullptr);
    }
    SetNumColsInternal(m_pRecordset->ColumnCount());
    m_lNumRows = 0;
    m_bNumRowsKnown = !countRows;
    m_lRow = 0;
    m_lCurrentRow = m_pRecordset->IsEOF() ? -1 : 0;
    m_tableType = type;
}

long CQoInputFilterODBC::CalculateRecordCount()
{
    if (m_bNumRowsKnown)
        return m_lNumRows;
    m_lNumRows = 0;
    if (HasOpenRecordset()) {
        try {
            if (!m_pRecordset->IsBOF())
                m_pRecordset->MoveFirst();
            while (!m_pRecordset->IsEOF()) {
                ++m_lNumRows;
                m_pRecordset->MoveNext();
            }
            // Back to the row the reader stood on, so that counting in the
            // middle of a walk does not end the walk.
            if (m_lCurrentRow >= 0 && m_lRow < m_lNumRows)
                m_pRecordset->SetAbsolutePosition(m_lRow + 1);
        } catch (CDBException* e) {
            QoDbRaise(e);
        }
        m_bNumRowsKnown = true;
    }
    return m_lNumRows;
}

bool CQoInputFilterODBC::FirstRow()
{
    if (!HasOpenRecordset())
        return false;
    try {
        m_pRecordset->MoveFirst();
    } catch (CDBException* e) {
        m_strLastError = QoDbTakeMessage(e);
        m_lCurrentRow = -1;
        return false;
    }
    m_lRow = 0;
    // An empty result has no first row, although the move succeeded.
    m_lCurrentRow = m_pRecordset->IsEOF() ? -1 : 0;
    return m_lCurrentRow == 0;
}

bool CQoInputFilterODBC::NextRow()
{
    if (!HasOpenRecordset())
        return false;
    try {
        m_pRecordset->MoveNext();
    } catch (CDBException* e) {
        m_strLastError = QoDbTakeMessage(e);
        return false;
    }
    if (m_pRecordset->IsEOF())
        return false;
    ++m_lRow;
    m_lCurrentRow = m_lRow;
    return true;
}

bool CQoInputFilterODBC::AbsoluteRow(long row)
{
    try {
        if (!HasOpenRecordset() || row < 0 || row >= NumRows())
            return false;
        if (row == 0)
            return FirstRow();
        // An absolute move: the cursor may stand elsewhere than m_lRow says
        // (after counting, after a failed move).
        m_pRecordset->SetAbsolutePosition(row + 1);
        m_lRow = row;
        if (m_pRecordset->IsEOF() || m_pRecordset->IsBOF())
            return false;
        m_lCurrentRow = row;
        return true;
    } catch (CDBException* e) {
        m_strLastError = QoDbTakeMessage(e);
        return false;
    } catch (const CQoException&) {
        return false;   // counting failed
    }
}

void CQoInputFilterODBC::Value(int col, CQoString& value)
{
    if (col >= 0 && col < NumCols() && m_pRecordset) {
        const CString& text = m_pRecordset->m_values[col];
        value.Assign((const char*)text, (std::size_t)text.GetLength());
    } else {
        value.Empty();
    }
}

void CQoInputFilterODBC::ColName(int col, CQoString& name)
{
    name.Empty();
    if (col >= 0 && col < NumCols() && m_pRecordset) {
        CODBCFieldInfo info;
        m_pRecordset->GetODBCFieldInfo((short)col, info);
        name = (const char*)info.m_strName;
    }
}

void CQoInputFilterODBC::CloseResources()
{
    if (m_pRecordset) {
        try {
            if (m_pRecordset->IsOpen())
                m_pRecordset->Close();
        } catch (CDBException* e) {
            e->Delete();   // a read-only recordset has nothing to lose
        }
        delete m_pRecordset;
        m_pRecordset = NULL;
    }
    if (m_database.IsOpen())
        m_database.Close();
    CQoInputFilterDB::CloseResources();
}
