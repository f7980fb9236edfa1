#include "CColoredListCtrl.h"

namespace {
const int kMinColumnWidth = 50;
const int kMeasuredRows = 300;   // enough to judge a column, cheap on any file
const int kCellRightGap = 4;
const int kSeparatorHeight = 2;
const UINT kCellFormat = DT_END_ELLIPSIS | DT_SINGLELINE | DT_BOTTOM | DT_VCENTER | DT_NOPREFIX | DT_NOCLIP;
}

BEGIN_MESSAGE_MAP(CColoredListCtrl, CListCtrl)
    ON_NOTIFY_REFLECT(LVN_ITEMCHANGED, OnItemchanged)
    ON_NOTIFY_REFLECT(LVN_ITEMCHANGING, OnItemchanging)
END_MESSAGE_MAP()

CColoredListCtrl::CColoredListCtrl()
    : m_bFontPrepared(false),
      m_pBoldFont(NULL),
      m_bDontShowSelected(false),
      m_nHeaderLines(0),
      m_header(this)
{
}

CColoredListCtrl::~CColoredListCtrl()
{
    delete m_pBoldFont;
}

bool CColoredListCtrl::ItemChanging()
{
    return true;
}

void CColoredListCtrl::ItemChanged()
{
}

void CColoredListCtrl::Init()
{
    ASSERT(::IsWindow(m_hWnd));
    if (m_header.m_hWnd != NULL) return;  // a second Init would subclass the window twice
    HWND hHeader = ::GetDlgItem(m_hWnd, 0);
    if (hHeader != NULL) m_header.SubclassWindow(hHeader);
}

void CColoredListCtrl::SetDontShowSelected(bool bDontShow)
{
    m_bDontShowSelected = bDontShow;
}

void CColoredListCtrl::SetHeaderLines(int nLines)
{
    m_nHeaderLines = nLines;
}

void CColoredListCtrl::AddListener(CColoredListCtrlListener* pListener)
{
    m_listeners.insert(pListener);
}

void CColoredListCtrl::RemoveListener(CColoredListCtrlListener* pListener)
{
    m_listeners.erase(pListener);
}

void CColoredListCtrl::OnItemchanged(NMHDR*, LRESULT* pResult)
{
    ItemChanged();
    *pResult = 0;
}

void CColoredListCtrl::OnItemchanging(NMHDR*, LRESULT* pResult)
{
    *pResult = ItemChanging() ? 0 : 1;
}

// The bold variant is made from whatever font the list paints with, once: trying
// again on every row would cost a font per paint when creation fails.
void CColoredListCtrl::PrepareBoldFont(CDC* pDC)
{
    if (m_bFontPrepared) return;
    m_bFontPrepared = true;
    CFont* pFont = pDC->GetCurrentFont();
    if (pFont == NULL) return;
    LOGFONT lf;
    if (pFont->GetLogFont(&lf) == 0) return;
    lf.lfWeight = FW_BOLD;
    CFont* pBold = new CFont;
    if (!pBold->CreateFontIndirect(&lf)) {
        delete pBold;
        return;
    }
    m_pBoldFont = pBold;
}

// A listener may remove itself (or another) while it is told; the copy keeps the
// walk valid and tells each listener registered at the start exactly once.
void CColoredListCtrl::NoticeOrderChange(const std::vector<int>& order)
{
    if (!m_lastOrder.empty() && m_lastOrder.size() == order.size() && m_lastOrder != order) {
        const std::vector<CColoredListCtrlListener*> listeners(m_listeners.begin(), m_listeners.end());
        for (CColoredListCtrlListener* pListener : listeners) {
            if (m_listeners.count(pListener) != 0) pListener->ColoredListCtrlOrderChanged();
        }
    }
    m_lastOrder = order;
}

// Where column 0's cell would start if the shown columns were laid out from the
// header's first item: the label rectangle already carries the horizontal scroll.
int CColoredListCtrl::FirstCellLeft(int item, const std::vector<int>& order, CRect& rcLabel)
{
    rcLabel.SetRectEmpty();
    GetItemRect(item, &rcLabel, LVIR_LABEL);
    int x = rcLabel.left;
    for (size_t p = 0; p < order.size() && order[p] != 0; ++p) x -= GetColumnWidth(order[p]);
    if (x < 0) x = 0;
    CHeaderCtrl* pHeader = GetHeaderCtrl();
    if (!order.empty() && pHeader != NULL) {
        CRect rcFirst;
        if (pHeader->GetItemRect(order[0], &rcFirst)) {
            ::MapWindowPoints(pHeader->m_hWnd, m_hWnd, reinterpret_cast<POINT*>(&rcFirst), 2);
            x += rcFirst.left;
        }
    }
    return x;
}

void CColoredListCtrl::PaintCells(CDC* pDC, int item, bool selected, const std::vector<int>& order, int x,
                                  const CRect& rcLabel)
{
    for (int column : order) {
        CString text;
        DWORD clr = 0, clrSelected = 0;
        bool bold = false;
        GetColoredItem(item, column, text, clr, clrSelected, bold);
        const int width = GetColumnWidth(column);
        CRect rcText(x, rcLabel.top, x + width - kCellRightGap, rcLabel.bottom);
        pDC->SetTextColor(selected ? clrSelected : clr);

        LVCOLUMN lvc;
        memset(&lvc, 0, sizeof(lvc));
        lvc.mask = LVCF_FMT;
        GetColumn(column, &lvc);
        const UINT align = (lvc.fmt & LVCFMT_JUSTIFYMASK) == LVCFMT_RIGHT ? DT_RIGHT : DT_LEFT;

        CFont* pOld = NULL;
        if (m_pBoldFont != NULL && bold) pOld = pDC->SelectObject(m_pBoldFont);
        pDC->DrawText(text, &rcText, kCellFormat | align);
        if (pOld != NULL) pDC->SelectObject(pOld);
        x += width;
    }
}

void CColoredListCtrl::DrawItem(LPDRAWITEMSTRUCT lpDrawItemStruct)
{
    const int item = static_cast<int>(lpDrawItemStruct->itemID);
    const UINT state = lpDrawItemStruct->itemState;
    const bool selected = !m_bDontShowSelected && (state & ODS_SELECTED) != 0;
    if (lpDrawItemStruct->hDC == NULL) return;
    CDC* pDC = CDC::FromHandle(lpDrawItemStruct->hDC);
    if (pDC == NULL) return;

    PrepareBoldFont(pDC);
    const COLORREF oldText = pDC->GetTextColor();
    const int oldMode = pDC->SetBkMode(OPAQUE);

    COLORREF background;
    if (selected)
        background = ::GetSysColor(COLOR_HIGHLIGHT);
    else if (IsWindowEnabled())
        background = GetBkColor();
    else
        background = ::GetSysColor(COLOR_BTNFACE);
    if (m_nHeaderLines > 0 && item < m_nHeaderLines) background = ::GetSysColor(COLOR_BTNFACE);
    const CRect rcItem(lpDrawItemStruct->rcItem);
    pDC->FillSolidRect(&rcItem, background);
    // Opaque texts must sit on the row's own colour, not on whatever the list left
    // in the device context for its selected row.
    const COLORREF oldBack = pDC->SetBkColor(background);

    CHeaderCtrl* pHeader = GetHeaderCtrl();
    const int columns = pHeader != NULL ? pHeader->GetItemCount() : 0;
    std::vector<int> order(columns > 0 ? columns : 0);
    if (!order.empty()) GetColumnOrderArray(order.data(), columns);
    NoticeOrderChange(order);

    CRect rcLabel;
    const int x = FirstCellLeft(item, order, rcLabel);

    CString text;
    DWORD clr = 0, clrSelected = 0;
    bool bold = false;
    if (GetColoredItem(item, 0, text, clr, clrSelected, bold) == 0) {
        const int top = rcItem.top + (rcItem.Height() - kSeparatorHeight) / 2;
        pDC->FillSolidRect(rcItem.left, top, rcItem.Width(), kSeparatorHeight, selected ? clrSelected : clr);
    } else {
        PaintCells(pDC, item, selected, order, x, rcLabel);
    }

    if (!m_bDontShowSelected && (state & ODS_FOCUS) != 0) pDC->DrawFocusRect(&rcItem);
    pDC->SetTextColor(oldText);
    pDC->SetBkColor(oldBack);
    pDC->SetBkMode(oldMode);
}

// Measured in the list's own font: the bare window DC holds the system font, whose
// widths are not those of the painted cells.
int CColoredListCtrl::GetMaxColumnWidth(int column)
{
    CHeaderCtrl* pHeader = GetHeaderCtrl();
    const int columns = pHeader != NULL ? pHeader->GetItemCount() : 0;
    if (column < 0 || column >= columns) return kMinColumnWidth;
    CDC* pDC = GetDC();
    if (pDC == NULL) return kMinColumnWidth;
    CFont* pFont = GetFont();
    CFont* pOld = pFont != NULL ? pDC->SelectObject(pFont) : NULL;

    int widest = 0;
    const int count = GetItemCount();
    const int rows = count < kMeasuredRows ? count : kMeasuredRows;
    for (int row = 0; row < rows; ++row) {
        CString text;
        DWORD clr = 0, clrSelected = 0;
        bool bold = false;
        if (GetColoredItem(row, column, text, clr, clrSelected, bold) == 0) continue;
        CRect rc(0, 0, 0, 0);
        pDC->DrawText(text, &rc, DT_CALCRECT | DT_SINGLELINE);
        if (rc.Width() > widest) widest = rc.Width();
    }
    if (pOld != NULL) pDC->SelectObject(pOld);
    ReleaseDC(pDC);
    return widest > kMinColumnWidth ? widest : kMinColumnWidth;
}

int CColoredListCtrl::ColumnAtScreenPoint(CPoint point)
{
    if (!::IsWindow(m_hWnd))
        return -1;
    CRect rcList;
    GetWindowRect(&rcList);
    CHeaderCtrl* pHeader = GetHeaderCtrl();
    if (!rcList.PtInRect(point) || pHeader == NULL)
        return -1;
    const int nItems = pHeader->GetItemCount();
    for (int i = 0; i < nItems; ++i) {
        CRect rcItem;
        if (!pHeader->GetItemRect(i, &rcItem))
            continue;
        pHeader->ClientToScreen(&rcItem);
        if (rcItem.left <= point.x && point.x <= rcItem.right)
            return i;
    }
    return -1;
}
