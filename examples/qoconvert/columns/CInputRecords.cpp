#include "CInputRecords.h"

#include <CQoString.h>

CInputRecords::CInputRecords(CQoInputFilter* filter) : m_pFilter(filter), m_lRow(-1)
{
}

void CInputRecords::SetInputFilter(CQoInputFilter* filter)
{
    m_pFilter = filter;
    m_lRow = -1;
    ThawView();
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

void CInputRecords::ReadValue(long row, int column, CQoString& value)
{
    if (MoveTo(row))
        m_pFilter->Value(column, value);
}

void CInputRecords::ReadName(int column, CQoString& name)
{
    if (m_pFilter != nullptr)
        m_pFilter->ColName(column, name);
}

int CInputRecords::NumSourceColumns()
{
    return m_pFilter != nullptr ? m_pFilter->NumCols() : 0;
}

long CInputRecords::NumSourceRows()
{
    if (m_pFilter == nullptr)
        return 0;
    if (m_lRowLimit > 0) {
        bool reached = m_pFilter->AbsoluteRow(m_lRowLimit - 1);
        m_lRow = reached ? m_lRowLimit - 1 : -1;
        if (reached)
            return m_lRowLimit;
    }
    return m_pFilter->NumRows();
}
