#include "CQoInputFilterDB.h"

CQoInputFilterDB::CQoInputFilterDB() = default;

void CQoInputFilterDB::CloseResources()
{
    m_lCurrentRow = -1;
}

void CQoInputFilterDB::InitTable(char const *name, tabletype type, bool countRows)
{
    m_strTableName = name;
    m_tableType = type;
    m_bNumRowsKnown = !countRows;
    m_lNumRows = 0;
    m_lCurrentRow = -1;
    m_bModified = true;
}
