// The standard controls: one Win32 message per operation. Owner-drawn list and
// combo boxes and buttons receive their drawing messages back from the parent.
#include "afxpriv.h"

IMPLEMENT_DYNAMIC(CStatic, CWnd)
IMPLEMENT_DYNAMIC(CButton, CWnd)
IMPLEMENT_DYNAMIC(CEdit, CWnd)
IMPLEMENT_DYNAMIC(CListBox, CWnd)
IMPLEMENT_DYNAMIC(CComboBox, CWnd)
IMPLEMENT_DYNAMIC(CScrollBar, CWnd)

static inline LRESULT SendCtrl(HWND hWnd, UINT message, WPARAM wParam, LPARAM lParam) {
  ASSERT(::IsWindow(hWnd));
  return ::SendMessageA(hWnd, message, wParam, lParam);
}
#define SEND(msg, w, l) SendCtrl(m_hWnd, (msg), (WPARAM)(w), (LPARAM)(l))

// ---------------------------------------------------------------------------
// CStatic
// ---------------------------------------------------------------------------

BOOL CStatic::Create(LPCTSTR lpszText, DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID) {
  return CWnd::Create("STATIC", lpszText, dwStyle, rect, pParentWnd, nID);
}
// Shows the icon (SS_ICON); the previous icon.
HICON CStatic::SetIcon(HICON hIcon) { return (HICON)SEND(STM_SETICON, hIcon, 0); }
HICON CStatic::GetIcon() const { return (HICON)SEND(STM_GETICON, 0, 0); }
// Shows the bitmap (SS_BITMAP); the previous bitmap.
HBITMAP CStatic::SetBitmap(HBITMAP hBitmap) { return (HBITMAP)SEND(STM_SETIMAGE, IMAGE_BITMAP, hBitmap); }
HBITMAP CStatic::GetBitmap() const { return (HBITMAP)SEND(STM_GETIMAGE, IMAGE_BITMAP, 0); }

// ---------------------------------------------------------------------------
// CButton
// ---------------------------------------------------------------------------

BOOL CButton::Create(LPCTSTR lpszCaption, DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID) {
  return CWnd::Create("BUTTON", lpszCaption, dwStyle, rect, pParentWnd, nID);
}
// BST_UNCHECKED, BST_CHECKED or BST_INDETERMINATE.
int CButton::GetCheck() const { return (int)SEND(BM_GETCHECK, 0, 0); }
void CButton::SetCheck(int nCheck) { SEND(BM_SETCHECK, nCheck, 0); }
// Check, push and focus state bits.
UINT CButton::GetState() const { return (UINT)SEND(BM_GETSTATE, 0, 0); }
void CButton::SetState(BOOL bHighlight) { SEND(BM_SETSTATE, bHighlight, 0); }
// The BS_ style of the button.
UINT CButton::GetButtonStyle() const { return (UINT)::GetWindowLongA(m_hWnd, GWL_STYLE) & 0xFFFF; }
void CButton::SetButtonStyle(UINT nStyle, BOOL bRedraw) { SEND(BM_SETSTYLE, nStyle, bRedraw); }
HICON CButton::SetIcon(HICON hIcon) { return (HICON)SEND(BM_SETIMAGE, IMAGE_ICON, hIcon); }
HBITMAP CButton::SetBitmap(HBITMAP hBitmap) { return (HBITMAP)SEND(BM_SETIMAGE, IMAGE_BITMAP, hBitmap); }

void CButton::DrawItem(LPDRAWITEMSTRUCT) {
  ASSERT(FALSE); // an owner-drawn button must override DrawItem
}

BOOL CButton::OnChildNotify(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* pResult) {
  if (message != WM_DRAWITEM) return CWnd::OnChildNotify(message, wParam, lParam, pResult);
  DrawItem((LPDRAWITEMSTRUCT)lParam);
  if (pResult != NULL) *pResult = TRUE;
  return TRUE;
}

// ---------------------------------------------------------------------------
// CEdit
// ---------------------------------------------------------------------------

BOOL CEdit::Create(DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID) {
  return CWnd::Create("EDIT", NULL, dwStyle, rect, pParentWnd, nID);
}
// Selects characters nStartChar up to nEndChar (-1: to the end).
void CEdit::SetSel(int nStartChar, int nEndChar, BOOL bNoScroll) {
  SEND(EM_SETSEL, nStartChar, nEndChar);
  if (!bNoScroll) SEND(EM_SCROLLCARET, 0, 0);
}
void CEdit::SetSel(DWORD dwSelection, BOOL bNoScroll) { SetSel((short)LOWORD(dwSelection), (short)HIWORD(dwSelection), bNoScroll); }
// Start in the low word, end in the high word.
DWORD CEdit::GetSel() const { return (DWORD)SEND(EM_GETSEL, 0, 0); }
void CEdit::GetSel(int& nStartChar, int& nEndChar) const {
  DWORD dwStart = 0, dwEnd = 0;
  SEND(EM_GETSEL, &dwStart, &dwEnd);
  nStartChar = (int)dwStart;
  nEndChar = (int)dwEnd;
}
void CEdit::ReplaceSel(LPCTSTR lpszNewText, BOOL bCanUndo) { SEND(EM_REPLACESEL, bCanUndo, lpszNewText); }
// At most nChars characters (0: the system's maximum).
void CEdit::LimitText(int nChars) { SEND(EM_LIMITTEXT, nChars, 0); }
void CEdit::SetLimitText(UINT nMax) { SEND(EM_SETLIMITTEXT, nMax, 0); }
UINT CEdit::GetLimitText() const { return (UINT)SEND(EM_GETLIMITTEXT, 0, 0); }
BOOL CEdit::SetReadOnly(BOOL bReadOnly) { return (BOOL)SEND(EM_SETREADONLY, bReadOnly, 0); }
int CEdit::GetLineCount() const { return (int)SEND(EM_GETLINECOUNT, 0, 0); }
// The character index where line nLine starts (-1: the caret's line).
int CEdit::LineIndex(int nLine) const { return (int)SEND(EM_LINEINDEX, nLine, 0); }
// The length of the line holding character nLine (-1: the selection's lines).
int CEdit::LineLength(int nLine) const { return (int)SEND(EM_LINELENGTH, nLine, 0); }
// Copies line nIndex (not NUL-terminated); the first WORD of lpszBuffer gives its size.
int CEdit::GetLine(int nIndex, LPTSTR lpszBuffer) const { return (int)SEND(EM_GETLINE, nIndex, lpszBuffer); }
int CEdit::GetLine(int nIndex, LPTSTR lpszBuffer, int nMaxLength) const {
  ASSERT(nMaxLength >= (int)sizeof(WORD));
  *(LPWORD)lpszBuffer = (WORD)nMaxLength;
  return (int)SEND(EM_GETLINE, nIndex, lpszBuffer);
}
BOOL CEdit::GetModify() const { return (BOOL)SEND(EM_GETMODIFY, 0, 0); }
void CEdit::SetModify(BOOL bModified) { SEND(EM_SETMODIFY, bModified, 0); }
void CEdit::Clear() { SEND(WM_CLEAR, 0, 0); }
void CEdit::Copy() { SEND(WM_COPY, 0, 0); }
void CEdit::Cut() { SEND(WM_CUT, 0, 0); }
void CEdit::Paste() { SEND(WM_PASTE, 0, 0); }
BOOL CEdit::Undo() { return (BOOL)SEND(EM_UNDO, 0, 0); }

namespace {

// The owner-draw messages that a list box or combo box gets back from its
// parent: drawn, measured, compared and freed by the control's own virtuals.
template <class Control>
bool ReflectOwnerDraw(Control* control, UINT message, LPARAM lParam, LRESULT* pResult) {
  LRESULT result = TRUE;
  switch (message) {
  case WM_DRAWITEM:
    control->DrawItem((LPDRAWITEMSTRUCT)lParam);
    break;
  case WM_MEASUREITEM:
    control->MeasureItem((LPMEASUREITEMSTRUCT)lParam);
    break;
  case WM_COMPAREITEM:
    result = control->CompareItem((LPCOMPAREITEMSTRUCT)lParam);
    break;
  case WM_DELETEITEM:
    control->DeleteItem((LPDELETEITEMSTRUCT)lParam);
    break;
  default:
    return false;
  }
  if (pResult != NULL) *pResult = result;
  return true;
}

}  // namespace

// ---------------------------------------------------------------------------
// CListBox
// ---------------------------------------------------------------------------

BOOL CListBox::Create(DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID) {
  return CWnd::Create("LISTBOX", NULL, dwStyle, rect, pParentWnd, nID);
}
// The index of the new item (sorted lists put it in order), LB_ERR/LB_ERRSPACE on failure.
int CListBox::AddString(LPCTSTR lpszItem) { return (int)SEND(LB_ADDSTRING, 0, lpszItem); }
int CListBox::InsertString(int nIndex, LPCTSTR lpszItem) { return (int)SEND(LB_INSERTSTRING, nIndex, lpszItem); }
// The number of items left.
int CListBox::DeleteString(UINT nIndex) { return (int)SEND(LB_DELETESTRING, nIndex, 0); }
void CListBox::ResetContent() { SEND(LB_RESETCONTENT, 0, 0); }
int CListBox::GetCount() const { return (int)SEND(LB_GETCOUNT, 0, 0); }
// Single-selection lists only; LB_ERR when nothing is selected.
int CListBox::GetCurSel() const { return (int)SEND(LB_GETCURSEL, 0, 0); }
int CListBox::SetCurSel(int nSelect) { return (int)SEND(LB_SETCURSEL, nSelect, 0); }
// Multiple-selection lists.
int CListBox::GetSel(int nIndex) const { return (int)SEND(LB_GETSEL, nIndex, 0); }
int CListBox::SetSel(int nIndex, BOOL bSelect) { return (int)SEND(LB_SETSEL, bSelect, nIndex); }
int CListBox::GetSelCount() const { return (int)SEND(LB_GETSELCOUNT, 0, 0); }
int CListBox::GetSelItems(int nMaxItems, LPINT rgIndex) const { return (int)SEND(LB_GETSELITEMS, nMaxItems, rgIndex); }
// lpszBuffer must hold GetTextLen(nIndex) + 1 characters.
int CListBox::GetText(int nIndex, LPTSTR lpszBuffer) const { return (int)SEND(LB_GETTEXT, nIndex, lpszBuffer); }
void CListBox::GetText(int nIndex, CString& rString) const {
  int nLen = GetTextLen(nIndex);
  if (nLen == LB_ERR) {
    rString.Empty();
    return;
  }
  SEND(LB_GETTEXT, nIndex, rString.GetBufferSetLength(nLen));
  rString.ReleaseBuffer();
}
int CListBox::GetTextLen(int nIndex) const { return (int)SEND(LB_GETTEXTLEN, nIndex, 0); }
int CListBox::SetItemData(int nIndex, DWORD_PTR dwItemData) { return (int)SEND(LB_SETITEMDATA, nIndex, dwItemData); }
DWORD_PTR CListBox::GetItemData(int nIndex) const { return (DWORD_PTR)SEND(LB_GETITEMDATA, nIndex, 0); }
int CListBox::SetItemDataPtr(int nIndex, void* pData) { return SetItemData(nIndex, (DWORD_PTR)pData); }
void* CListBox::GetItemDataPtr(int nIndex) const { return (void*)GetItemData(nIndex); }
// Prefix search (case-insensitive) after nStartAfter (-1: from the top).
int CListBox::FindString(int nStartAfter, LPCTSTR lpszItem) const { return (int)SEND(LB_FINDSTRING, nStartAfter, lpszItem); }
int CListBox::FindStringExact(int nIndexStart, LPCTSTR lpszFind) const {
  return (int)SEND(LB_FINDSTRINGEXACT, nIndexStart, lpszFind);
}
int CListBox::SelectString(int nStartAfter, LPCTSTR lpszItem) { return (int)SEND(LB_SELECTSTRING, nStartAfter, lpszItem); }
void CListBox::SetHorizontalExtent(int cxExtent) { SEND(LB_SETHORIZONTALEXTENT, cxExtent, 0); }
int CListBox::GetHorizontalExtent() const { return (int)SEND(LB_GETHORIZONTALEXTENT, 0, 0); }
int CListBox::GetTopIndex() const { return (int)SEND(LB_GETTOPINDEX, 0, 0); }
int CListBox::SetTopIndex(int nIndex) { return (int)SEND(LB_SETTOPINDEX, nIndex, 0); }
int CListBox::GetItemRect(int nIndex, LPRECT lpRect) const { return (int)SEND(LB_GETITEMRECT, nIndex, lpRect); }
int CListBox::GetItemHeight(int nIndex) const { return (int)SEND(LB_GETITEMHEIGHT, nIndex, 0); }
int CListBox::SetItemHeight(int nIndex, UINT cyItemHeight) {
  return (int)SEND(LB_SETITEMHEIGHT, nIndex, MAKELONG(cyItemHeight, 0));
}
int CListBox::GetCaretIndex() const { return (int)SEND(LB_GETCARETINDEX, 0, 0); }
int CListBox::SetCaretIndex(int nIndex, BOOL bScroll) { return (int)SEND(LB_SETCARETINDEX, nIndex, MAKELONG(bScroll, 0)); }
UINT CListBox::ItemFromPoint(CPoint pt, BOOL& bOutside) const {
  DWORD dw = (DWORD)SEND(LB_ITEMFROMPOINT, 0, MAKELPARAM(pt.x, pt.y));
  bOutside = HIWORD(dw) != 0;
  return LOWORD(dw);
}

void CListBox::DrawItem(LPDRAWITEMSTRUCT) {
  ASSERT(FALSE); // an owner-drawn list box must override DrawItem
}
void CListBox::MeasureItem(LPMEASUREITEMSTRUCT) {
  ASSERT(FALSE); // LBS_OWNERDRAWVARIABLE needs MeasureItem
}
int CListBox::CompareItem(LPCOMPAREITEMSTRUCT) {
  ASSERT(FALSE); // a sorted owner-drawn list box without strings needs CompareItem
  return 0;
}
void CListBox::DeleteItem(LPDELETEITEMSTRUCT) {}

BOOL CListBox::OnChildNotify(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* pResult) {
  if (ReflectOwnerDraw(this, message, lParam, pResult))
    return TRUE;
  return CWnd::OnChildNotify(message, wParam, lParam, pResult);
}

// ---------------------------------------------------------------------------
// CComboBox
// ---------------------------------------------------------------------------

BOOL CComboBox::Create(DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID) {
  return CWnd::Create("COMBOBOX", NULL, dwStyle, rect, pParentWnd, nID);
}
int CComboBox::AddString(LPCTSTR lpszString) { return (int)SEND(CB_ADDSTRING, 0, lpszString); }
int CComboBox::InsertString(int nIndex, LPCTSTR lpszString) { return (int)SEND(CB_INSERTSTRING, nIndex, lpszString); }
int CComboBox::DeleteString(UINT nIndex) { return (int)SEND(CB_DELETESTRING, nIndex, 0); }
void CComboBox::ResetContent() { SEND(CB_RESETCONTENT, 0, 0); }
int CComboBox::GetCount() const { return (int)SEND(CB_GETCOUNT, 0, 0); }
// CB_ERR when nothing is selected.
int CComboBox::GetCurSel() const { return (int)SEND(CB_GETCURSEL, 0, 0); }
int CComboBox::SetCurSel(int nSelect) { return (int)SEND(CB_SETCURSEL, nSelect, 0); }
// lpszText must hold GetLBTextLen(nIndex) + 1 characters.
int CComboBox::GetLBText(int nIndex, LPTSTR lpszText) const { return (int)SEND(CB_GETLBTEXT, nIndex, lpszText); }
void CComboBox::GetLBText(int nIndex, CString& rString) const {
  int nLen = GetLBTextLen(nIndex);
  if (nLen == CB_ERR) {
    rString.Empty();
    return;
  }
  SEND(CB_GETLBTEXT, nIndex, rString.GetBufferSetLength(nLen));
  rString.ReleaseBuffer();
}
int CComboBox::GetLBTextLen(int nIndex) const { return (int)SEND(CB_GETLBTEXTLEN, nIndex, 0); }
int CComboBox::SetItemData(int nIndex, DWORD_PTR dwItemData) { return (int)SEND(CB_SETITEMDATA, nIndex, dwItemData); }
DWORD_PTR CComboBox::GetItemData(int nIndex) const { return (DWORD_PTR)SEND(CB_GETITEMDATA, nIndex, 0); }
int CComboBox::SetItemDataPtr(int nIndex, void* pData) { return SetItemData(nIndex, (DWORD_PTR)pData); }
void* CComboBox::GetItemDataPtr(int nIndex) const { return (void*)GetItemData(nIndex); }
int CComboBox::FindString(int nStartAfter, LPCTSTR lpszString) const {
  return (int)SEND(CB_FINDSTRING, nStartAfter, lpszString);
}
int CComboBox::FindStringExact(int nIndexStart, LPCTSTR lpszFind) const {
  return (int)SEND(CB_FINDSTRINGEXACT, nIndexStart, lpszFind);
}
int CComboBox::SelectString(int nStartAfter, LPCTSTR lpszString) {
  return (int)SEND(CB_SELECTSTRING, nStartAfter, lpszString);
}
// Selection in the edit field; -1 as start removes it.
BOOL CComboBox::SetEditSel(int nStartChar, int nEndChar) {
  return (BOOL)SEND(CB_SETEDITSEL, 0, MAKELONG(nStartChar, nEndChar));
}
DWORD CComboBox::GetEditSel() const { return (DWORD)SEND(CB_GETEDITSEL, 0, 0); }
BOOL CComboBox::LimitText(int nMaxChars) { return (BOOL)SEND(CB_LIMITTEXT, nMaxChars, 0); }
void CComboBox::ShowDropDown(BOOL bShowIt) { SEND(CB_SHOWDROPDOWN, bShowIt, 0); }
BOOL CComboBox::GetDroppedState() const { return (BOOL)SEND(CB_GETDROPPEDSTATE, 0, 0); }
int CComboBox::SetDroppedWidth(UINT nWidth) { return (int)SEND(CB_SETDROPPEDWIDTH, nWidth, 0); }
void CComboBox::SetHorizontalExtent(UINT nExtent) { SEND(CB_SETHORIZONTALEXTENT, nExtent, 0); }
int CComboBox::GetTopIndex() const { return (int)SEND(CB_GETTOPINDEX, 0, 0); }
int CComboBox::SetTopIndex(int nIndex) { return (int)SEND(CB_SETTOPINDEX, nIndex, 0); }
int CComboBox::GetItemHeight(int nIndex) const { return (int)SEND(CB_GETITEMHEIGHT, nIndex, 0); }
int CComboBox::SetItemHeight(int nIndex, UINT cyItemHeight) {
  return (int)SEND(CB_SETITEMHEIGHT, nIndex, MAKELONG(cyItemHeight, 0));
}

void CComboBox::DrawItem(LPDRAWITEMSTRUCT) {
  ASSERT(FALSE); // an owner-drawn combo box must override DrawItem
}
void CComboBox::MeasureItem(LPMEASUREITEMSTRUCT) {
  ASSERT(FALSE); // CBS_OWNERDRAWVARIABLE needs MeasureItem
}
int CComboBox::CompareItem(LPCOMPAREITEMSTRUCT) {
  ASSERT(FALSE);
  return 0;
}
void CComboBox::DeleteItem(LPDELETEITEMSTRUCT) {}

BOOL CComboBox::OnChildNotify(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* pResult) {
  if (ReflectOwnerDraw(this, message, lParam, pResult))
    return TRUE;
  return CWnd::OnChildNotify(message, wParam, lParam, pResult);
}

// ---------------------------------------------------------------------------
// CScrollBar
// ---------------------------------------------------------------------------

BOOL CScrollBar::Create(DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID) {
  return CWnd::Create("SCROLLBAR", NULL, dwStyle, rect, pParentWnd, nID);
}
int CScrollBar::GetScrollPos() const { return ::GetScrollPos(m_hWnd, SB_CTL); }
int CScrollBar::SetScrollPos(int nPos, BOOL bRedraw) { return ::SetScrollPos(m_hWnd, SB_CTL, nPos, bRedraw); }
void CScrollBar::GetScrollRange(LPINT lpMinPos, LPINT lpMaxPos) const {
  ::GetScrollRange(m_hWnd, SB_CTL, lpMinPos, lpMaxPos);
}
void CScrollBar::SetScrollRange(int nMinPos, int nMaxPos, BOOL bRedraw) {
  ::SetScrollRange(m_hWnd, SB_CTL, nMinPos, nMaxPos, bRedraw);
}
BOOL CScrollBar::SetScrollInfo(LPSCROLLINFO lpScrollInfo, BOOL bRedraw) {
  lpScrollInfo->cbSize = sizeof(SCROLLINFO);
  ::SetScrollInfo(m_hWnd, SB_CTL, lpScrollInfo, bRedraw);
  return TRUE;
}
BOOL CScrollBar::GetScrollInfo(LPSCROLLINFO lpScrollInfo, UINT nMask) {
  lpScrollInfo->cbSize = sizeof(SCROLLINFO);
  lpScrollInfo->fMask = nMask;
  return ::GetScrollInfo(m_hWnd, SB_CTL, lpScrollInfo);
}
void CScrollBar::ShowScrollBar(BOOL bShow) { ::ShowScrollBar(m_hWnd, SB_CTL, bShow); }
BOOL CScrollBar::EnableScrollBar(UINT nArrowFlags) { return ::EnableScrollBar(m_hWnd, SB_CTL, nArrowFlags); }
