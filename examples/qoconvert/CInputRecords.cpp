#include "CInputRecords.h"

#include <CQoString.h>

CInputRecords::CInputRecords(CQoInputFilter* filter)
    : m_pFilter(filter), m_lRow(-1)
{
}

void CInputRecords::SetInputFilter(CQoInputFilter* filter)
{
    m_pFilter = filter;
    m_lRow = -1;
    InitArray();
}

bool CInputRecords::MoveTo(long row)
{
    if (m_pFilter == nullptr || row < 0)
        return false;
    if (row == m_lRow)
        return true;
    bool found = (row == 0) ? m_pFilter->FirstRow()
                 : (row == m_lRow + 1 && m_lRow >= 0) ? m_pFilter->NextRow()
                                                      : m_pFilter->AbsoluteRow(row);
    m_lRow = found ? row : -1;
    return found;
}

void CInputRecords::GetSourceValue(long row, int column, CString& value)
{
    value.Empty();
    if (!MoveTo(row))
        return;
    CQoString text;
    m_pFilter->Value(column, text);
    value.SetString(text.GetString(), text.GetLength());
}

void CInputRecords::GetSourceName(int column, CString& name, int /*flag*/)
{
    name.Empty();
    if (m_pFilter == nullptr)
        return;
    CQoString text;
    m_pFilter->ColName(column, text);
    name.SetString(text.GetString(), text.GetLength());
}

int CInputRecords::NumSourceColumns()
{
    return m_pFilter != nullptr ? m_pFilter->NumCols() : 0;
}

long CInputRecords::NumSourceRows()
{
    return m_pFilter != nullptr ? m_pFilter->NumRows() : 0;
}
