#include "CInputRecords.h"

#include <CQoString.h>

CInputRecords::CInputRecords(CQoInputFilter* filter)
    : m_pFilter(filter), m_lRow(-1), m_bFrozen(false)
{
}

void CInputRecords::FreezeView()
{
    m_frozen.clear();
    m_bFrozen = false;
    // Capitals and umlaut folding change the text: those go the long way.
    if (GetUseCapitals() || GetNoUmlaute())
        return;
    for (int i = 0, n = GetEntryCount(); i < n; ++i) {
        CEntry entry;
        GetEntry(i, entry);
        if (entry.GetSelected())
            m_frozen.push_back(entry.GetColumn());
    }
    m_bFrozen = true;
}

void CInputRecords::GetValue(long row, int col, CQoString& value)
{
    if (!m_bFrozen) {
        COutputFilterSource::GetValue(row, col, value);
        return;
    }
    value.Empty();
    if (col < 0 || col >= static_cast<int>(m_frozen.size()) || !MoveTo(row))
        return;
    m_pFilter->Value(m_frozen[col], value);
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
