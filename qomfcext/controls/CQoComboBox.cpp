#include "CQoComboBox.h"

CQoComboBox::CQoComboBox() {}

CQoComboBox::~CQoComboBox() {}

int CQoComboBox::AddString(const char* lpszText, int bEnabled)
{
    ASSERT(::IsWindow(m_hWnd));
    const int nIndex = CComboBox::AddString(lpszText);
    if (nIndex >= 0) SetItemData(nIndex, bEnabled ? 1 : 0);
    return nIndex;
}

int CQoComboBox::IsEnabled(int nIndex) const
{
    ASSERT(::IsWindow(m_hWnd));
    // CB_GETITEMDATA answers CB_ERR (-1) for a bad index, which is not 1.
    return GetItemData(nIndex) == 1;
}

void CQoComboBox::Enable(int nIndex, int bEnabled)
{
    ASSERT(::IsWindow(m_hWnd));
    SetItemData(nIndex, bEnabled ? 1 : 0);
}

void CQoComboBox::Init()
{
    ASSERT(::IsWindow(m_hWnd));
    CClientDC dc(this);
    CFont* pFont = GetFont();
    CFont* pOldFont = pFont != NULL ? dc.SelectObject(pFont) : NULL;
    TEXTMETRIC tm;
    dc.GetTextMetrics(&tm);
    if (pOldFont != NULL) dc.SelectObject(pOldFont);
    const UINT nHeight = tm.tmHeight + 2;
    SetItemHeight(0, nHeight);   // the items of the list
    SetItemHeight(-1, nHeight);  // the selection field
}

void CQoComboBox::MeasureItem(LPMEASUREITEMSTRUCT) {}

void CQoComboBox::DrawItem(LPDRAWITEMSTRUCT lpDIS)
{
    CDC* pDC = CDC::FromHandle(lpDIS->hDC);
    const CRect rc(lpDIS->rcItem);
    const int nItem = static_cast<int>(lpDIS->itemID);
    const bool bContent = (lpDIS->itemAction & (ODA_DRAWENTIRE | ODA_SELECT)) != 0;

    if (bContent && nItem >= 0) {
        COLORREF clrText, clrBack;
        if (lpDIS->itemState & ODS_SELECTED) {
            clrText = ::GetSysColor(COLOR_HIGHLIGHTTEXT);
            clrBack = ::GetSysColor(COLOR_HIGHLIGHT);
        } else {
            clrText = ::GetSysColor(COLOR_WINDOWTEXT);
            clrBack = ::GetSysColor(COLOR_WINDOW);
        }
        if (lpDIS->itemData == 0) clrText = ::GetSysColor(COLOR_GRAYTEXT);
        if ((lpDIS->itemState & ODS_DISABLED) || !IsWindowEnabled()) {
            clrText = ::GetSysColor(COLOR_GRAYTEXT);
            clrBack = ::GetSysColor(COLOR_BTNFACE);
        }
        CString strText;
        GetLBText(nItem, strText);
        CFont* pFont = GetFont();
        CFont* pOldFont = pFont != NULL ? pDC->SelectObject(pFont) : NULL;
        const COLORREF clrOldText = pDC->SetTextColor(clrText);
        const COLORREF clrOldBack = pDC->SetBkColor(clrBack);
        pDC->ExtTextOut(rc.left + 2, rc.top, ETO_OPAQUE, &rc, strText, strText.GetLength(), NULL);
        pDC->SetBkColor(clrOldBack);
        pDC->SetTextColor(clrOldText);
        if (pOldFont != NULL) pDC->SelectObject(pOldFont);
    } else if (bContent) {
        // An empty selection field: nothing of an earlier text may stay behind.
        const COLORREF clrOldBack = pDC->SetBkColor(::GetSysColor(IsWindowEnabled() ? COLOR_WINDOW : COLOR_BTNFACE));
        pDC->ExtTextOut(rc.left, rc.top, ETO_OPAQUE, &rc, "", 0, NULL);
        pDC->SetBkColor(clrOldBack);
    }

    // The focus rectangle is drawn with XOR: an ODA_FOCUS call toggles it, a
    // fresh paint of the focused item draws it once.
    if (lpDIS->itemAction == ODA_FOCUS || (bContent && (lpDIS->itemState & ODS_FOCUS)))
        pDC->DrawFocusRect(&rc);
}
