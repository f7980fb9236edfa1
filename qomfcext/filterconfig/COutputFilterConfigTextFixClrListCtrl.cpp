#include "COutputFilterConfigTextFixClrListCtrl.h"

#include "COutputFilterConfigTextFix.h"

COutputFilterConfigTextFixClrListCtrl::COutputFilterConfigTextFixClrListCtrl(COutputFilterConfigTextFix* pPage)
    : m_pPage(pPage)
{
}

COutputFilterConfigTextFixClrListCtrl::~COutputFilterConfigTextFixClrListCtrl() {}

int COutputFilterConfigTextFixClrListCtrl::GetColoredItem(int row, int col, CString& text, DWORD& clrTextOut,
                                                          DWORD& clrSelectedTextOut, bool& bold)
{
    if (m_pPage == NULL)
        return 1;
    bold = false;
    clrTextOut = clrText;
    clrSelectedTextOut = clrSelectedText;
    text.Empty();
    // The item count is set by the page, but a host may load other columns
    // before it refreshes: a row beyond them stays empty instead of failing
    // inside a paint.
    COutputFilterConfigTextFix::SCol column;
    if (!m_pPage->GetColumn(row, column))
        return 1;
    switch (col) {
    case 0:
        text = column.strName;
        break;
    case 1:
        text.Format("%d", column.nOffset);
        clrTextOut = clrComputed;
        clrSelectedTextOut = clrComputed;
        break;
    case 2:
        text.Format("%d", column.nLength);
        break;
    }
    return 1;
}

void COutputFilterConfigTextFixClrListCtrl::ItemChanged()
{
    if (m_pPage != NULL)
        m_pPage->ListItemChanged();
}
