#include "CQoDatabase.h"

CQoDatabase::CQoDatabase(CQoString const &name)
    : m_strName(name)
{
}

CQoDatabase::~CQoDatabase() = default;

CQoString CQoDatabase::GetConnectString()
{
    return m_strName;
}
