// The report list and its header: one common-control message per operation.
#include "afxpriv.h"
#include "win_private.h"
#include "afxcmn.h"

IMPLEMENT_DYNAMIC(CHeaderCtrl, CWnd)
IMPLEMENT_DYNAMIC(CListCtrl, CWnd)

static inline LRESULT SendCtrl(HWND hWnd, UINT message, WPARAM wParam, LPARAM lParam) {
  ASSERT(::IsWindow(hWnd));
  return ::SendMessageA(hWnd, message, wParam, lParam);
}
#define SEND(msg, w, l) SendCtrl(m_hWnd, (msg), (WPARAM)(w), (LPARAM)(l))

// ---------------------------------------------------------------------------
// CHeaderCtrl
// ---------------------------------------------------------------------------

int CHeaderCtrl::GetItemCount() const { return (int)SEND(HDM_GETITEMCOUNT, 0, 0); }
BOOL CHeaderCtrl::SetItem(int nPos, HDITEM* pHeaderItem) { return (BOOL)SEND(HDM_SETITEMA, nPos, pHeaderItem); }
BOOL CHeaderCtrl::GetItemRect(int nIndex, LPRECT lpRect) const { return (BOOL)SEND(HDM_GETITEMRECT, nIndex, lpRect); }

// ---------------------------------------------------------------------------
// CListCtrl
// ---------------------------------------------------------------------------

BOOL CListCtrl::Create(DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID) {
  return CWnd::Create(WC_LISTVIEWA, NULL, dwStyle, rect, pParentWnd, nID);
}
CHeaderCtrl* CListCtrl::GetHeaderCtrl() const {
  HWND hHeader = (HWND)SEND(LVM_GETHEADER, 0, 0);
  return hHeader == NULL ? NULL : (CHeaderCtrl*)CWnd::FromHandle(hHeader);
}
int CListCtrl::InsertColumn(int nCol, LPCTSTR lpszColumnHeading, int nFormat, int nWidth, int nSubItem) {
  LVCOLUMNA column;
  memset(&column, 0, sizeof(column));
  column.mask = LVCF_TEXT | LVCF_FMT;
  column.pszText = (LPSTR)lpszColumnHeading;
  column.fmt = nFormat;
  if (nWidth != -1) {
    column.mask |= LVCF_WIDTH;
    column.cx = nWidth;
  }
  if (nSubItem != -1) {
    column.mask |= LVCF_SUBITEM;
    column.iSubItem = nSubItem;
  }
  return (int)SEND(LVM_INSERTCOLUMNA, nCol, &column);
}
BOOL CListCtrl::GetColumn(int nCol, LVCOLUMN* pColumn) const { return (BOOL)SEND(LVM_GETCOLUMNA, nCol, pColumn); }
int CListCtrl::GetColumnWidth(int nCol) const { return (int)SEND(LVM_GETCOLUMNWIDTH, nCol, 0); }
BOOL CListCtrl::SetColumnWidth(int nCol, int cx) { return (BOOL)SEND(LVM_SETCOLUMNWIDTH, nCol, MAKELPARAM(cx, 0)); }
BOOL CListCtrl::GetColumnOrderArray(LPINT piArray, int iCount) const {
  if (iCount < 0) {
    CHeaderCtrl* pHeader = GetHeaderCtrl();
    if (pHeader == NULL) return FALSE;
    iCount = pHeader->GetItemCount();
  }
  return (BOOL)SEND(LVM_GETCOLUMNORDERARRAY, iCount, piArray);
}
BOOL CListCtrl::SetColumnOrderArray(int iCount, LPINT piArray) {
  return (BOOL)SEND(LVM_SETCOLUMNORDERARRAY, iCount, piArray);
}
int CListCtrl::GetItemCount() const { return (int)SEND(LVM_GETITEMCOUNT, 0, 0); }
void CListCtrl::SetItemCountEx(int iCount, DWORD dwFlags) {
  ASSERT((GetStyle() & LVS_OWNERDATA) != 0 || dwFlags == 0);
  SEND(LVM_SETITEMCOUNT, iCount, dwFlags);
}
BOOL CListCtrl::GetItemRect(int nItem, LPRECT lpRect, UINT nCode) const {
  ASSERT(lpRect != NULL);
  lpRect->left = (LONG)nCode;
  return (BOOL)SEND(LVM_GETITEMRECT, nItem, lpRect);
}
UINT CListCtrl::GetItemState(int nItem, UINT nMask) const { return (UINT)SEND(LVM_GETITEMSTATE, nItem, nMask); }
BOOL CListCtrl::SetItemState(int nItem, UINT nState, UINT nMask) {
  LVITEMA item;
  memset(&item, 0, sizeof(item));
  item.stateMask = nMask;
  item.state = nState;
  return (BOOL)SEND(LVM_SETITEMSTATE, nItem, &item);
}
COLORREF CListCtrl::GetBkColor() const { return (COLORREF)SEND(LVM_GETBKCOLOR, 0, 0); }
BOOL CListCtrl::SetColumn(int nCol, const LVCOLUMN* pColumn) { return (BOOL)SEND(LVM_SETCOLUMNA, nCol, pColumn); }
BOOL CListCtrl::DeleteColumn(int nCol) { return (BOOL)SEND(LVM_DELETECOLUMN, nCol, 0); }
int CListCtrl::GetStringWidth(LPCTSTR lpsz) const { return (int)SEND(LVM_GETSTRINGWIDTHA, 0, lpsz); }
int CListCtrl::InsertItem(int nItem, LPCTSTR lpszItem, int nImage) {
  LVITEMA item;
  memset(&item, 0, sizeof(item));
  item.mask = LVIF_TEXT | LVIF_IMAGE;
  item.iItem = nItem;
  item.pszText = (LPSTR)lpszItem;
  item.iImage = nImage;
  return (int)SEND(LVM_INSERTITEMA, 0, &item);
}
int CListCtrl::FindItem(LVFINDINFO* pFindInfo, int nStart) const {
  return (int)SEND(LVM_FINDITEMA, nStart, pFindInfo);
}
CImageList* CListCtrl::SetImageList(CImageList* pImageList, int nImageListType) {
  SEND(LVM_SETIMAGELIST, nImageListType, pImageList != NULL ? pImageList->m_hImageList : NULL);
  return NULL;
}
int CListCtrl::InsertItem(int nItem, LPCTSTR lpszItem) {
  LVITEMA item;
  memset(&item, 0, sizeof(item));
  item.mask = LVIF_TEXT;
  item.iItem = nItem;
  item.pszText = (LPSTR)lpszItem;
  return (int)SEND(LVM_INSERTITEMA, 0, &item);
}
BOOL CListCtrl::SetItemText(int nItem, int nSubItem, LPCTSTR lpszText) {
  LVITEMA item;
  memset(&item, 0, sizeof(item));
  item.iSubItem = nSubItem;
  item.pszText = (LPSTR)lpszText;
  return (BOOL)SEND(LVM_SETITEMTEXTA, nItem, &item);
}
// LVM_GETITEMTEXT answers the length copied; a full buffer may mean the text was
// cut, so the buffer grows until the text fits.
CString CListCtrl::GetItemText(int nItem, int nSubItem) const {
  CString str;
  LVITEMA item;
  for (int nLen = 256;; nLen *= 2) {
    memset(&item, 0, sizeof(item));
    item.iSubItem = nSubItem;
    item.cchTextMax = nLen;
    item.pszText = str.GetBufferSetLength(nLen);
    int nGot = (int)SEND(LVM_GETITEMTEXTA, nItem, &item);
    if (nGot < nLen - 1 || nLen >= (1 << 20)) {
      str.ReleaseBuffer(nGot < nLen ? nGot : nLen - 1);
      return str;
    }
  }
}
BOOL CListCtrl::DeleteAllItems() { return (BOOL)SEND(LVM_DELETEALLITEMS, 0, 0); }
BOOL CListCtrl::DeleteItem(int nItem) { return (BOOL)SEND(LVM_DELETEITEM, nItem, 0); }
BOOL CListCtrl::SetItemData(int nItem, DWORD_PTR dwData) {
  LVITEMA item;
  memset(&item, 0, sizeof(item));
  item.mask = LVIF_PARAM;
  item.iItem = nItem;
  item.lParam = (LPARAM)dwData;
  return (BOOL)SEND(LVM_SETITEMA, 0, &item);
}
DWORD_PTR CListCtrl::GetItemData(int nItem) const {
  LVITEMA item;
  memset(&item, 0, sizeof(item));
  item.mask = LVIF_PARAM;
  item.iItem = nItem;
  if (!SEND(LVM_GETITEMA, 0, &item)) return 0;
  return (DWORD_PTR)item.lParam;
}
int CListCtrl::GetNextItem(int nItem, int nFlags) const { return (int)SEND(LVM_GETNEXTITEM, nItem, MAKELPARAM(nFlags, 0)); }
DWORD CListCtrl::GetExtendedStyle() const { return (DWORD)SEND(LVM_GETEXTENDEDLISTVIEWSTYLE, 0, 0); }
DWORD CListCtrl::SetExtendedStyle(DWORD dwNewStyle) { return (DWORD)SEND(LVM_SETEXTENDEDLISTVIEWSTYLE, 0, dwNewStyle); }
BOOL CListCtrl::EnsureVisible(int nItem, BOOL bPartialOK) { return (BOOL)SEND(LVM_ENSUREVISIBLE, nItem, bPartialOK); }
int CListCtrl::GetTopIndex() const { return (int)SEND(LVM_GETTOPINDEX, 0, 0); }
int CListCtrl::GetCountPerPage() const { return (int)SEND(LVM_GETCOUNTPERPAGE, 0, 0); }
BOOL CListCtrl::Update(int nItem) { return (BOOL)SEND(LVM_UPDATE, nItem, 0); }

void CListCtrl::DrawItem(LPDRAWITEMSTRUCT) {
  ASSERT(FALSE); // an owner-drawn list must override DrawItem
}

BOOL CListCtrl::OnChildNotify(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* pResult) {
  if (message != WM_DRAWITEM) return CWnd::OnChildNotify(message, wParam, lParam, pResult);
  DrawItem((LPDRAWITEMSTRUCT)lParam);
  if (pResult != NULL) *pResult = TRUE;
  return TRUE;
}

// ---------------------------------------------------------------------------
// CImageList
// ---------------------------------------------------------------------------

CImageList::~CImageList() { DeleteImageList(); }
BOOL CImageList::Create(int cx, int cy, UINT nFlags, int nInitial, int nGrow) {
  DeleteImageList();
  const qownd::CommonControls& comctl = qownd::ComCtl();
  m_hImageList = comctl.ImageListCreate != nullptr ? comctl.ImageListCreate(cx, cy, nFlags, nInitial, nGrow) : NULL;
  return m_hImageList != NULL;
}
int CImageList::Add(HICON hIcon) {
  return m_hImageList != NULL ? qownd::ComCtl().ImageListReplaceIcon(m_hImageList, -1, hIcon) : -1;
}
int CImageList::GetImageCount() const {
  return m_hImageList != NULL ? qownd::ComCtl().ImageListGetImageCount(m_hImageList) : 0;
}
BOOL CImageList::DeleteImageList() {
  if (m_hImageList == NULL) return FALSE;
  qownd::ComCtl().ImageListDestroy(m_hImageList);
  m_hImageList = NULL;
  return TRUE;
}
