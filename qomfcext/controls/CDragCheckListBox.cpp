#include "CDragCheckListBox.h"

#include "QoWidenListBox.h"

IMPLEMENT_DYNAMIC(CDragCheckListBox, CCheckListBox)

BEGIN_MESSAGE_MAP(CDragCheckListBox, CCheckListBox)
    ON_WM_LBUTTONDOWN()
    ON_WM_LBUTTONUP()
    ON_WM_KEYDOWN()
    ON_WM_MOUSEMOVE()
    ON_MESSAGE(WM_CAPTURECHANGED, OnCaptureChanged)
    ON_MESSAGE(LB_GETITEMDATA, OnLBGetItemData)
    ON_MESSAGE(LB_SETITEMDATA, OnLBSetItemData)
END_MESSAGE_MAP()

CDragCheckListBox::CDragCheckListBox(int nNotifierId, bool bNoDrag)
    : CModifiedNotifier(nNotifierId),
      m_nDragSource(-1),
      m_nDropTarget(-1),
      m_nMarkerPos(-1),
      m_bDragging(FALSE),
      m_nWidest(0),
      m_bNoDrag(bNoDrag)
{
}

CDragCheckListBox::~CDragCheckListBox() {}

int CDragCheckListBox::AddString(const char* lpszItem)
{
    QoWidenListBox(*this, m_nWidest, lpszItem);
    return CCheckListBox::AddString(lpszItem);
}

int CDragCheckListBox::AddString(const char* lpszItem, long lData, int nCheck)
{
    int nIndex = AddString(lpszItem);
    if (nIndex >= 0) {
        SetItemData(nIndex, static_cast<DWORD_PTR>(lData));
        SetCheck(nIndex, nCheck ? 1 : 0);
    }
    return nIndex;
}

int CDragCheckListBox::ItemAt(CPoint point)
{
    int nCount = GetCount();
    if (nCount <= 0)
        return -1;
    BOOL bOutside = FALSE;
    int nIndex = static_cast<int>(ItemFromPoint(point, bOutside));
    CRect rc;
    if (nIndex < 0 || nIndex >= nCount || GetItemRect(nIndex, &rc) == LB_ERR || !rc.PtInRect(point))
        return -1;
    return nIndex;
}

void CDragCheckListBox::OnLButtonDown(UINT nFlags, CPoint point)
{
    if (!m_bNoDrag) {
        m_nMarkerPos = -1;
        m_nDropTarget = -1;
        // A press below the last item takes nothing along: were the nearest
        // item its source, the last item would follow a drag from empty space.
        m_nDragSource = ItemAt(point);
        if (m_nDragSource >= 0) {
            m_bDragging = TRUE;
            SetCapture();
        }
    }
    // A press on the box ticks or unticks it, a press on the text selects.
    CCheckListBox::OnLButtonDown(nFlags, point);
}

void CDragCheckListBox::OnMouseMove(UINT nFlags, CPoint point)
{
    if (!m_bDragging) {
        CCheckListBox::OnMouseMove(nFlags, point);
        return;
    }
    int nCount = GetCount();
    BOOL bOutside = FALSE;
    int nIndex = static_cast<int>(ItemFromPoint(point, bOutside));
    CRect rc;
    if (nIndex < 0 || nIndex >= nCount || GetItemRect(nIndex, &rc) == LB_ERR)
        return;
    // The lower half of an item puts the dragged one after it, the upper half before.
    if (point.y >= (rc.top + rc.bottom) / 2) {
        m_nDropTarget = nIndex + 1;
        DrawMarker(rc.bottom);
    } else {
        m_nDropTarget = nIndex;
        DrawMarker(rc.top);
    }
}

void CDragCheckListBox::OnLButtonUp(UINT nFlags, CPoint point)
{
    if (m_bDragging) {
        m_bDragging = FALSE;
        DrawMarker(-1);
        ReleaseCapture();
        const int nSource = m_nDragSource;
        const int nTarget = m_nDropTarget;
        m_nDragSource = m_nDropTarget = -1;
        // Just before or just after itself the item would stay where it is.
        if (ItemAt(point) >= 0 && nSource >= 0 && nTarget >= 0 && nTarget != nSource && nTarget != nSource + 1)
            MoveItem(nSource, nTarget);
    } else {
        CCheckListBox::OnLButtonUp(nFlags, point);
    }
    NotifyListeners();
}

LRESULT CDragCheckListBox::OnCaptureChanged(WPARAM, LPARAM lParam)
{
    // Another window took the mouse (a message box, the task switcher): the
    // button's release will never reach this list, so the drag ends here
    // without a move.
    if (m_bDragging && reinterpret_cast<HWND>(lParam) != m_hWnd) {
        m_bDragging = FALSE;
        DrawMarker(-1);
        m_nDragSource = m_nDropTarget = -1;
    }
    return Default();
}

void CDragCheckListBox::OnKeyDown(UINT nChar, UINT nRepCnt, UINT nFlags)
{
    CCheckListBox::OnKeyDown(nChar, nRepCnt, nFlags);
    NotifyListeners();
}

void CDragCheckListBox::DrawMarker(int y)
{
    if (y == m_nMarkerPos)
        return;
    // A repaint that came after the bar was inverted on would leave half of
    // it behind when it is inverted off: let pending painting happen first.
    if (m_nMarkerPos == -1)
        UpdateWindow();
    CClientDC dc(this);
    CRect rc;
    GetClientRect(&rc);
    CBrush* pOld = dc.SelectObject(CDC::GetHalftoneBrush());
    if (m_nMarkerPos != -1)
        dc.PatBlt(0, m_nMarkerPos - 1, rc.Width(), 3, PATINVERT);
    if (y != -1)
        dc.PatBlt(0, y - 1, rc.Width(), 3, PATINVERT);
    dc.SelectObject(pOld);
    m_nMarkerPos = y;
}

void CDragCheckListBox::MoveItem(int nFrom, int nBefore)
{
    const DWORD_PTR data = GetItemData(nFrom);
    const BOOL bEnabled = IsEnabled(nFrom);
    const int nCheck = GetCheck(nFrom);
    CString text;
    GetText(nFrom, text);
    DeleteString(nFrom);
    if (nFrom < nBefore)
        --nBefore;
    const int nNew = nBefore < GetCount() ? CListBox::InsertString(nBefore, text) : CListBox::AddString(text);
    if (nNew < 0)
        return;
    SetItemData(nNew, data);
    Enable(nNew, bEnabled);
    SetCheck(nNew, nCheck);
    SetCurSel(nNew);
}
