#include "CFreezableSource.h"

void CFreezableSource::FreezeView()
{
    ThawView();
    if (GetUseCapitals() || GetNoUmlaute())
        return;
    for (int i = 0, n = GetEntryCount(); i < n; ++i) {
        CEntry entry;
        if (GetEntry(i, entry) && entry.GetSelected())
            m_frozen.push_back(entry.GetColumn());
    }
    m_bFrozen = true;
}

void CFreezableSource::GetValue(long row, int col, CQoString& value)
{
    if (!m_bFrozen) {
        COutputFilterSource::GetValue(row, col, value);
        return;
    }
    value.Empty();
    if (col >= 0 && col < static_cast<int>(m_frozen.size()))
        ReadValue(row, m_frozen[static_cast<size_t>(col)], value);
}

void CFreezableSource::GetSourceValue(long row, int column, CString& value)
{
    CQoString text;
    ReadValue(row, column, text);
    value.SetString(text.GetString(), text.GetLength());
}

void CFreezableSource::GetSourceName(int column, CString& name, int /*flag*/)
{
    CQoString text;
    ReadName(column, text);
    name.SetString(text.GetString(), text.GetLength());
}
