#include "CQoOutputFilterDB.h"

#include "CQoException.h"

CQoOutputFilterDB::CQoOutputFilterDB() = default;

void CQoOutputFilterDB::NumCols(int cols)
{
    CQoOutputFilter::NumCols(cols);
    std::size_t n = m_columnNames.size();
    m_types.resize(n, dbtypeText);
    m_lengths.resize(n, defaultLength);
    m_indexed.resize(n, 0);
}

void CQoOutputFilterDB::SetType(int col, int type)
{
    CheckColumn(col);
    m_types[col] = type;
}

void CQoOutputFilterDB::SetLength(int col, int length)
{
    CheckColumn(col);
    m_lengths[col] = length;
}

void CQoOutputFilterDB::SetIndexed(int col, bool indexed)
{
    CheckColumn(col);
    m_indexed[col] = indexed ? 1 : 0;
}

bool CQoOutputFilterDB::GetIndexed(int col)
{
    CheckColumn(col);
    return m_indexed[col] != 0;
}

int CQoOutputFilterDB::GetType(int col)
{
    CheckColumn(col);
    return m_types[col];
}

int CQoOutputFilterDB::GetLength(int col)
{
    CheckColumn(col);
    return m_lengths[col];
}

void CQoOutputFilterDB::SetShowError(bool show)
{
    m_bShowError = show;
}

void CQoOutputFilterDB::UseDB(CQoDatabase *db)
{
    m_pDatabase = db;
}

void CQoOutputFilterDB::UseDB(char const *name)
{
    m_strDBName = name;
}

void CQoOutputFilterDB::ReleaseDB()
{
    m_pDatabase = nullptr;
}
