#include "CQoODBCRecordset.h"

IMPLEMENT_DYNAMIC(CQoODBCRecordset, CRecordset)

CQoODBCRecordset::CQoODBCRecordset(CDatabase* database)
    : CRecordset(database), m_nColumns(0), m_nResultColumns(0)
{
    m_nFields = maxColumns;
    m_nDefaultType = snapshot;
    for (int i = 0; i < maxColumns; ++i)
        m_lengths[i] = textLength;
}

CQoODBCRecordset::~CQoODBCRecordset()
{
}

CString CQoODBCRecordset::GetDefaultConnect()
{
    return "ODBC;DSN=";
}

CString CQoODBCRecordset::GetDefaultSQL()
{
    return "";
}

void CQoODBCRecordset::DoFieldExchange(CFieldExchange* pFX)
{
    if (m_nColumns == 0) {
        m_nResultColumns = GetODBCFieldCount();
        m_nColumns = m_nResultColumns < maxColumns ? m_nResultColumns : maxColumns;
        m_nFields = m_nColumns;
        for (int i = 0; i < m_nColumns; ++i) {
            CODBCFieldInfo info;
            GetODBCFieldInfo((short)i, info);
            m_names[i] = info.m_strName;
            // A wider column is read and written whole: the usual 255 would
            // cut its values without a word.
            if (info.m_nPrecision > textLength && info.m_nPrecision < 0x7FFFFFFF)
                m_lengths[i] = (int)info.m_nPrecision;
        }
    }
    pFX->SetFieldType(CFieldExchange::outputColumn);
    for (UINT i = 0; i < m_nFields; ++i)
        RFX_Text(pFX, m_names[i], m_values[i], m_lengths[i], SQL_VARCHAR, 0);
}

void CQoODBCRecordset::ThrowDBException(RETCODE nRetCode, HSTMT hstmt)
{
    AfxThrowDBException(nRetCode, m_pDatabase, hstmt != SQL_NULL_HSTMT ? hstmt : m_hstmt);
}
