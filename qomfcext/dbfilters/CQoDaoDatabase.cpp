#include "CQoDaoDatabase.h"

#include "QoDaoError.h"

CQoDaoDatabase::CQoDaoDatabase(const CQoString& name)
    : CQoDatabase(name)
{
}

CQoDaoDatabase::~CQoDaoDatabase()
{
    m_database.Close();
}

bool CQoDaoDatabase::Open(bool create)
{
    try {
        if (create)
            m_database.Create(GetName(), dbLangGeneral, 0);
        else
            m_database.Open(GetName(), FALSE, FALSE, "");
    } catch (CDaoException* e) {
        QoDaoRaise(e);
    }
    return IsOpen();
}

bool CQoDaoDatabase::IsOpen()
{
    try {
        return m_database.IsOpen() != FALSE;
    } catch (CDaoException* e) {
        QoDaoRaise(e);
    }
}

void CQoDaoDatabase::Close()
{
    try {
        if (m_database.IsOpen())
            m_database.Close();
    } catch (CDaoException* e) {
        QoDaoRaise(e);
    }
}

void CQoDaoDatabase::ExecuteSql(const char* sql)
{
    if (!IsOpen())
        return;
    try {
        CDaoQueryDef query(&m_database);
        query.Create(NULL, sql ? sql : "");
        query.Execute(dbFailOnError);
        query.Close();
    } catch (CDaoException* e) {
        QoDaoRaise(e);
    }
}
