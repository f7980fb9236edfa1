#include "CQoHeaderCtrl.h"

#include "CColoredListCtrl.h"

namespace {
const int kDividerReach = 10;  // pixels either side of a divider that count as "on it"
}

BEGIN_MESSAGE_MAP(CQoHeaderCtrl, CHeaderCtrl)
    ON_WM_LBUTTONDBLCLK()
END_MESSAGE_MAP()

CQoHeaderCtrl::CQoHeaderCtrl(CColoredListCtrl* pOwner) : m_pOwner(pOwner)
{
}

// The default handling is left out on purpose: the common control would size the
// column by its own idea of the texts, which an owner-drawn virtual list does not give it.
void CQoHeaderCtrl::OnLButtonDblClk(UINT, CPoint point)
{
    const int count = GetItemCount();
    int hit = -1;
    CRect rc;
    for (int i = 0; i < count; ++i) {
        if (GetItemRect(i, &rc) && rc.PtInRect(point)) {
            hit = i;
            break;
        }
    }
    if (hit < 0) return;

    const int dl = point.x - rc.left;
    const int dr = rc.right - point.x;
    const bool nearLeft = dl >= 0 && dl <= kDividerReach;
    const bool nearRight = dr >= 0 && dr <= kDividerReach;
    if (!nearLeft && !nearRight) return;

    const int column = (dl <= kDividerReach && hit > 0 && hit < count - 1) ? hit - 1 : hit;
    HDITEM item;
    memset(&item, 0, sizeof(item));
    item.mask = HDI_WIDTH;
    item.cxy = m_pOwner->GetMaxColumnWidth(column);
    SetItem(column, &item);
}
