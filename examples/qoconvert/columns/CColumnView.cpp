#include "CColumnView.h"

#include <CQoOutputSource.h>
#include <CQoString.h>
#include <QoLimits.h>

#include <algorithm>

CColumnView::CColumnView(CQoOutputSource* composed) : m_pComposed(composed)
{
}

void CColumnView::Sync(const Selection& wanted)
{
    ThawView();
    const int columns = NumSourceColumns();
    std::vector<CString> names(static_cast<size_t>(columns));
    for (int i = 0; i < columns; ++i)
        GetSourceName(i, names[static_cast<size_t>(i)], 0);
    std::vector<bool> placed(static_cast<size_t>(columns), false);

    RemoveAllEntries();
    for (const auto& column : wanted) {
        // Two columns of one name: each wanted entry takes the next of them.
        for (int i = 0; i < columns; ++i) {
            if (!placed[static_cast<size_t>(i)] && names[static_cast<size_t>(i)] == column.first) {
                placed[static_cast<size_t>(i)] = true;
                AddEntry(CEntry(i, names[static_cast<size_t>(i)], column.second));
                break;
            }
        }
    }
    for (int i = 0; i < columns; ++i)
        if (!placed[static_cast<size_t>(i)])
            AddEntry(CEntry(i, names[static_cast<size_t>(i)], true));
}

CColumnView::Selection CColumnView::GetSelection()
{
    Selection selection;
    for (int i = 0, n = GetEntryCount(); i < n; ++i) {
        CEntry entry;
        if (GetEntry(i, entry))
            selection.push_back(std::make_pair(entry.GetName(), entry.GetSelected()));
    }
    return selection;
}

void CColumnView::ReadValue(long row, int column, CQoString& value)
{
    if (m_pComposed != nullptr)
        m_pComposed->GetValue(row, column, value);
}

void CColumnView::ReadName(int column, CQoString& name)
{
    if (m_pComposed != nullptr)
        m_pComposed->GetColumnName(column, name);
}

int CColumnView::NumSourceColumns()
{
    if (m_pComposed == nullptr)
        return 0;
    return std::max(0, std::min(m_pComposed->GetNumColumns(), qolimits::maxColumns));
}

long CColumnView::NumSourceRows()
{
    return m_pComposed != nullptr ? m_pComposed->GetNumRows() : 0;
}
