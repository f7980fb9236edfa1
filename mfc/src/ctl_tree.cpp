// The tree view: one common-control message per operation.
#include "afxpriv.h"
#include "afxcmn.h"

#include <string.h>
#include <vector>

IMPLEMENT_DYNAMIC(CTreeCtrl, CWnd)

// ---------------------------------------------------------------------------
// CTreeCtrl
// ---------------------------------------------------------------------------

static inline LRESULT SendCtrl(HWND hWnd, UINT message, WPARAM wParam, LPARAM lParam) {
  ASSERT(::IsWindow(hWnd));
  return ::SendMessageA(hWnd, message, wParam, lParam);
}
#define SEND(msg, w, l) SendCtrl(m_hWnd, (msg), (WPARAM)(w), (LPARAM)(l))

BOOL CTreeCtrl::Create(DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID) {
  return CWnd::Create(WC_TREEVIEWA, NULL, dwStyle, rect, pParentWnd, nID);
}

CImageList* CTreeCtrl::SetImageList(CImageList* pImageList, int nImageListType) {
  SEND(TVM_SETIMAGELIST, nImageListType, pImageList != NULL ? pImageList->m_hImageList : NULL);
  return NULL;
}

HTREEITEM CTreeCtrl::InsertItem(LPTVINSERTSTRUCT lpInsertStruct) {
  return (HTREEITEM)SEND(TVM_INSERTITEMA, 0, lpInsertStruct);
}
HTREEITEM CTreeCtrl::InsertItem(UINT nMask, LPCTSTR lpszItem, int nImage, int nSelectedImage, UINT nState,
                                UINT nStateMask, LPARAM lParam, HTREEITEM hParent, HTREEITEM hInsertAfter) {
  TVINSERTSTRUCTA tvis;
  memset(&tvis, 0, sizeof(tvis));
  tvis.hParent = hParent;
  tvis.hInsertAfter = hInsertAfter;
  tvis.item.mask = nMask;
  tvis.item.pszText = (LPSTR)lpszItem;
  tvis.item.iImage = nImage;
  tvis.item.iSelectedImage = nSelectedImage;
  tvis.item.state = nState;
  tvis.item.stateMask = nStateMask;
  tvis.item.lParam = lParam;
  return InsertItem(&tvis);
}
HTREEITEM CTreeCtrl::InsertItem(LPCTSTR lpszItem, HTREEITEM hParent, HTREEITEM hInsertAfter) {
  return InsertItem(TVIF_TEXT, lpszItem, 0, 0, 0, 0, 0, hParent, hInsertAfter);
}
BOOL CTreeCtrl::DeleteItem(HTREEITEM hItem) { return (BOOL)SEND(TVM_DELETEITEM, 0, hItem); }
BOOL CTreeCtrl::DeleteAllItems() { return (BOOL)SEND(TVM_DELETEITEM, 0, TVI_ROOT); }
UINT CTreeCtrl::GetCount() const { return (UINT)SEND(TVM_GETCOUNT, 0, 0); }

BOOL CTreeCtrl::GetItem(TVITEM* pItem) const { return (BOOL)SEND(TVM_GETITEMA, 0, pItem); }
BOOL CTreeCtrl::SetItem(TVITEM* pItem) { return (BOOL)SEND(TVM_SETITEMA, 0, pItem); }
BOOL CTreeCtrl::SetItem(HTREEITEM hItem, UINT nMask, LPCTSTR lpszItem, int nImage, int nSelectedImage,
                        UINT nState, UINT nStateMask, LPARAM lParam) {
  TVITEMA item;
  memset(&item, 0, sizeof(item));
  item.hItem = hItem;
  item.mask = nMask;
  item.pszText = (LPSTR)lpszItem;
  item.iImage = nImage;
  item.iSelectedImage = nSelectedImage;
  item.state = nState;
  item.stateMask = nStateMask;
  item.lParam = lParam;
  return SetItem(&item);
}
CString CTreeCtrl::GetItemText(HTREEITEM hItem) const {
  // The control copies at most cchTextMax - 1 characters: grow until the text fits.
  for (int size = 256;; size *= 2) {
    std::vector<char> buf((size_t)size, '\0');
    TVITEMA item;
    memset(&item, 0, sizeof(item));
    item.hItem = hItem;
    item.mask = TVIF_TEXT;
    item.pszText = &buf[0];
    item.cchTextMax = size;
    if (!GetItem(&item)) return CString();
    // The control may answer with a pointer to its own copy instead of filling the buffer.
    if (item.pszText != &buf[0]) return CString(item.pszText);
    if ((int)strlen(&buf[0]) < size - 1 || size >= (1 << 20)) return CString(&buf[0]);
  }
}
BOOL CTreeCtrl::SetItemText(HTREEITEM hItem, LPCTSTR lpszItem) {
  return SetItem(hItem, TVIF_TEXT, lpszItem, 0, 0, 0, 0, 0);
}
DWORD_PTR CTreeCtrl::GetItemData(HTREEITEM hItem) const {
  TVITEMA item;
  memset(&item, 0, sizeof(item));
  item.hItem = hItem;
  item.mask = TVIF_PARAM;
  return GetItem(&item) ? (DWORD_PTR)item.lParam : 0;
}
BOOL CTreeCtrl::SetItemData(HTREEITEM hItem, DWORD_PTR dwData) {
  return SetItem(hItem, TVIF_PARAM, NULL, 0, 0, 0, 0, (LPARAM)dwData);
}
UINT CTreeCtrl::GetItemState(HTREEITEM hItem, UINT nStateMask) const {
  return (UINT)SEND(TVM_GETITEMSTATE, hItem, nStateMask);
}
BOOL CTreeCtrl::SetItemState(HTREEITEM hItem, UINT nState, UINT nStateMask) {
  return SetItem(hItem, TVIF_STATE, NULL, 0, 0, nState, nStateMask, 0);
}
BOOL CTreeCtrl::GetItemImage(HTREEITEM hItem, int& nImage, int& nSelectedImage) const {
  TVITEMA item;
  memset(&item, 0, sizeof(item));
  item.hItem = hItem;
  item.mask = TVIF_IMAGE | TVIF_SELECTEDIMAGE;
  if (!GetItem(&item)) return FALSE;
  nImage = item.iImage;
  nSelectedImage = item.iSelectedImage;
  return TRUE;
}
BOOL CTreeCtrl::ItemHasChildren(HTREEITEM hItem) const {
  TVITEMA item;
  memset(&item, 0, sizeof(item));
  item.hItem = hItem;
  item.mask = TVIF_CHILDREN;
  return GetItem(&item) && item.cChildren != 0;
}
BOOL CTreeCtrl::GetItemRect(HTREEITEM hItem, LPRECT lpRect, BOOL bTextOnly) const {
  ASSERT(lpRect != NULL);
  // The message takes the item's handle in the rectangle it fills.
  *(HTREEITEM*)lpRect = hItem;
  return (BOOL)SEND(TVM_GETITEMRECT, bTextOnly, lpRect);
}

HTREEITEM CTreeCtrl::GetNextItem(HTREEITEM hItem, UINT nCode) const {
  return (HTREEITEM)SEND(TVM_GETNEXTITEM, nCode, hItem);
}
HTREEITEM CTreeCtrl::GetChildItem(HTREEITEM hItem) const { return GetNextItem(hItem, TVGN_CHILD); }
HTREEITEM CTreeCtrl::GetNextSiblingItem(HTREEITEM hItem) const { return GetNextItem(hItem, TVGN_NEXT); }
HTREEITEM CTreeCtrl::GetPrevSiblingItem(HTREEITEM hItem) const { return GetNextItem(hItem, TVGN_PREVIOUS); }
HTREEITEM CTreeCtrl::GetParentItem(HTREEITEM hItem) const { return GetNextItem(hItem, TVGN_PARENT); }
HTREEITEM CTreeCtrl::GetRootItem() const { return GetNextItem(NULL, TVGN_ROOT); }
HTREEITEM CTreeCtrl::GetSelectedItem() const { return GetNextItem(NULL, TVGN_CARET); }
HTREEITEM CTreeCtrl::GetFirstVisibleItem() const { return GetNextItem(NULL, TVGN_FIRSTVISIBLE); }

BOOL CTreeCtrl::SelectItem(HTREEITEM hItem) { return (BOOL)SEND(TVM_SELECTITEM, TVGN_CARET, hItem); }
BOOL CTreeCtrl::Expand(HTREEITEM hItem, UINT nCode) { return (BOOL)SEND(TVM_EXPAND, nCode, hItem); }
BOOL CTreeCtrl::EnsureVisible(HTREEITEM hItem) { return (BOOL)SEND(TVM_ENSUREVISIBLE, 0, hItem); }
HTREEITEM CTreeCtrl::HitTest(CPoint pt, UINT* pFlags) const {
  TVHITTESTINFO info;
  memset(&info, 0, sizeof(info));
  info.pt = pt;
  HTREEITEM h = (HTREEITEM)SEND(TVM_HITTEST, 0, &info);
  if (pFlags != NULL) *pFlags = info.flags;
  return h;
}
