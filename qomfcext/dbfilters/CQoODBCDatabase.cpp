#include "CQoODBCDatabase.h"

#include <CQoException.h>

#include "QoDbError.h"
#include "resource.h"

CQoODBCDatabase::CQoODBCDatabase(const CQoString& name)
    : CQoDatabase(name)
{
}

CQoODBCDatabase::~CQoODBCDatabase()
{
    m_database.Close();
}

bool CQoODBCDatabase::Open(bool create)
{
    if (create) {
        CString text;
        text.LoadString(IDS_ODBC_MUST_EXIST);
        CQoException::Throw((const char*)text, nullptr);
    }
    try {
        m_database.OpenEx(GetName(), CDatabase::useCursorLib);
    } catch (CDBException* e) {
        QoDbRaise(e);
    }
    return IsOpen();
}

bool CQoODBCDatabase::IsOpen()
{
    return m_database.IsOpen() != FALSE;
}

void CQoODBCDatabase::Close()
{
    if (IsOpen())
        m_database.Close();
}

void CQoODBCDatabase::ExecuteSql(const char* sql)
{
    if (!IsOpen())
        return;
    try {
        m_database.ExecuteSQL(sql ? sql : "");
    } catch (CDBException* e) {
        QoDbRaise(e);
    }
}

CQoString CQoODBCDatabase::GetConnectString()
{
    CString connect = m_database.GetConnect();
    return CQoString((const char*)connect);
}
