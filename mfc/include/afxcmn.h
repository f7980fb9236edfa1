// The common controls of the MFC subset: thin wrappers that send one message of
// the Win32 common control per call, with MFC's names and return conventions.
// Owner-drawn report lists receive WM_DRAWITEM back from their parent and paint
// in DrawItem; the other notifications reach the control's message map through
// ON_NOTIFY_REFLECT.
#pragma once

#include "afxwin.h"

class AFX_API CHeaderCtrl : public CWnd {
  DECLARE_DYNAMIC(CHeaderCtrl)
public:
  CHeaderCtrl() {}

  int GetItemCount() const;
  BOOL SetItem(int nPos, HDITEM* pHeaderItem);
  // The item's rectangle in the header's client coordinates (by index, not position).
  BOOL GetItemRect(int nIndex, LPRECT lpRect) const;
};

// An image list of the common controls; the object owns its handle and destroys it
// with itself. A list control given one with SetImageList uses it without owning it
// only when the control has the style LVS_SHAREIMAGELISTS.
class AFX_API CImageList : public CObject {
public:
  CImageList() : m_hImageList(NULL) {}
  virtual ~CImageList();
  // cx by cy pixel images, ILC_ flags, room for nInitial images growing by nGrow.
  BOOL Create(int cx, int cy, UINT nFlags, int nInitial, int nGrow);
  // The icon's index in the list, -1 if it could not be added.
  int Add(HICON hIcon);
  int GetImageCount() const;
  BOOL DeleteImageList();
  HIMAGELIST GetSafeHandle() const { return m_hImageList; }

  HIMAGELIST m_hImageList;

private:
  CImageList(const CImageList&);
  CImageList& operator=(const CImageList&);
};

class AFX_API CListCtrl : public CWnd {
  DECLARE_DYNAMIC(CListCtrl)
public:
  CListCtrl() {}
  virtual BOOL Create(DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID);

  // The list's header, a temporary object unless the header has been subclassed.
  CHeaderCtrl* GetHeaderCtrl() const;
  int InsertColumn(int nCol, LPCTSTR lpszColumnHeading, int nFormat = LVCFMT_LEFT, int nWidth = -1,
                   int nSubItem = -1);
  BOOL GetColumn(int nCol, LVCOLUMN* pColumn) const;
  int GetColumnWidth(int nCol) const;
  BOOL SetColumnWidth(int nCol, int cx);
  // iCount -1: as many entries as the header has items.
  BOOL GetColumnOrderArray(LPINT piArray, int iCount = -1) const;
  BOOL SetColumnOrderArray(int iCount, LPINT piArray);
  BOOL SetColumn(int nCol, const LVCOLUMN* pColumn);
  BOOL DeleteColumn(int nCol);
  // Width in pixels of the text in the list's font.
  int GetStringWidth(LPCTSTR lpsz) const;

  int GetItemCount() const;
  // Virtual (LVS_OWNERDATA) lists only: the number of rows, and whether scrolling and
  // invalidation follow (LVSICF_NOSCROLL, LVSICF_NOINVALIDATEALL).
  void SetItemCountEx(int iCount, DWORD dwFlags = LVSICF_NOINVALIDATEALL);
  BOOL GetItemRect(int nItem, LPRECT lpRect, UINT nCode) const;
  UINT GetItemState(int nItem, UINT nMask) const;
  BOOL SetItemState(int nItem, UINT nState, UINT nMask);
  COLORREF GetBkColor() const;
  // Items of a list that holds its own rows (not LVS_OWNERDATA for the texts).
  int InsertItem(int nItem, LPCTSTR lpszItem);
  int InsertItem(int nItem, LPCTSTR lpszItem, int nImage);
  // The next item after nStart (-1: from the start) that matches, -1 if none.
  int FindItem(LVFINDINFO* pFindInfo, int nStart = -1) const;
  // LVSIL_NORMAL, LVSIL_SMALL or LVSIL_STATE. The previous list is answered only
  // as NULL: the subset keeps no wrapper objects for foreign handles.
  CImageList* SetImageList(CImageList* pImageList, int nImageListType);
  BOOL SetItemText(int nItem, int nSubItem, LPCTSTR lpszText);
  CString GetItemText(int nItem, int nSubItem) const;
  BOOL DeleteAllItems();
  BOOL DeleteItem(int nItem);
  BOOL SetItemData(int nItem, DWORD_PTR dwData);
  DWORD_PTR GetItemData(int nItem) const;
  // The next item after nItem (-1: from the start) with the LVNI_ flags, -1 if none.
  int GetNextItem(int nItem, int nFlags) const;
  // LVS_EX_ styles; SetExtendedStyle answers the previous ones.
  DWORD GetExtendedStyle() const;
  DWORD SetExtendedStyle(DWORD dwNewStyle);
  BOOL EnsureVisible(int nItem, BOOL bPartialOK);
  int GetTopIndex() const;
  int GetCountPerPage() const;
  // Repaints one item (LVM_UPDATE).
  BOOL Update(int nItem);

  // LVS_OWNERDRAWFIXED lists paint each row here; the parent reflects WM_DRAWITEM.
  virtual void DrawItem(LPDRAWITEMSTRUCT lpDrawItemStruct);

protected:
  virtual BOOL OnChildNotify(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* pResult);
};

// The up-down control ("spin button"). The 16-bit forms (SetRange, GetRange,
// SetPos, GetPos) pack their values into one message parameter as the control's
// first version did; the 32-bit forms reach the whole int range. With
// UDS_ARROWKEYS the arrow keys move it too; every change asks the parent first
// through UDN_DELTAPOS (answer nonzero to refuse it).
class AFX_API CSpinButtonCtrl : public CWnd {
  DECLARE_DYNAMIC(CSpinButtonCtrl)
public:
  CSpinButtonCtrl() {}
  virtual BOOL Create(DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID);

  // Acceleration steps: how far one step moves after how many seconds held.
  BOOL SetAccel(int nAccel, UDACCEL* pAccel);
  UINT GetAccel(int nAccel, UDACCEL* pAccel) const;
  // 10 (decimal) or 16 (hexadecimal) in the buddy; the previous base, 0 if refused.
  int SetBase(int nBase);
  UINT GetBase() const;
  // The window whose text follows the position (UDS_SETBUDDYINT); the previous one.
  CWnd* SetBuddy(CWnd* pWndBuddy);
  CWnd* GetBuddy() const;

  // Position, 16 bits: SetPos answers the previous position; GetPos answers the
  // position in the low word and a nonzero high word when the buddy's text is
  // not a valid position.
  int SetPos(int nPos);
  int GetPos() const;
  // Position, 32 bits: SetPos32 answers the previous position; GetPos32 puts
  // the error flag into *lpbError when given.
  int SetPos32(int nPos);
  int GetPos32(LPBOOL lpbError = NULL) const;

  // Range, 16 bits: the lower limit in the high word of GetRange(), the upper in
  // the low word. The lower limit may exceed the upper one (the arrows reverse).
  void SetRange(short nLower, short nUpper);
  DWORD GetRange() const;
  void GetRange(int& lower, int& upper) const;
  void SetRange32(int nLower, int nUpper);
  void GetRange32(int& lower, int& upper) const;
};

// The tree view. Items are HTREEITEM handles that stay valid until the item is
// deleted; texts are copied by the control. The notifications (TVN_SELCHANGING,
// TVN_ITEMEXPANDING, ...) reach the control's own message map through
// ON_NOTIFY_REFLECT, where a nonzero *pResult refuses the change.
class AFX_API CTreeCtrl : public CWnd {
  DECLARE_DYNAMIC(CTreeCtrl)
public:
  CTreeCtrl() {}
  virtual BOOL Create(DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID);

  // TVSIL_NORMAL or TVSIL_STATE; the control uses the list without owning it. The
  // previous list is answered only as NULL (no wrappers for foreign handles).
  CImageList* SetImageList(CImageList* pImageList, int nImageListType);

  HTREEITEM InsertItem(LPTVINSERTSTRUCT lpInsertStruct);
  HTREEITEM InsertItem(UINT nMask, LPCTSTR lpszItem, int nImage, int nSelectedImage, UINT nState,
                       UINT nStateMask, LPARAM lParam, HTREEITEM hParent, HTREEITEM hInsertAfter);
  HTREEITEM InsertItem(LPCTSTR lpszItem, HTREEITEM hParent = TVI_ROOT, HTREEITEM hInsertAfter = TVI_LAST);
  BOOL DeleteItem(HTREEITEM hItem);
  BOOL DeleteAllItems();
  UINT GetCount() const;

  // pItem->hItem and pItem->mask say which item and what to read or write.
  BOOL GetItem(TVITEM* pItem) const;
  BOOL SetItem(TVITEM* pItem);
  BOOL SetItem(HTREEITEM hItem, UINT nMask, LPCTSTR lpszItem, int nImage, int nSelectedImage, UINT nState,
               UINT nStateMask, LPARAM lParam);
  CString GetItemText(HTREEITEM hItem) const;
  BOOL SetItemText(HTREEITEM hItem, LPCTSTR lpszItem);
  DWORD_PTR GetItemData(HTREEITEM hItem) const;
  BOOL SetItemData(HTREEITEM hItem, DWORD_PTR dwData);
  UINT GetItemState(HTREEITEM hItem, UINT nStateMask) const;
  BOOL SetItemState(HTREEITEM hItem, UINT nState, UINT nStateMask);
  BOOL GetItemImage(HTREEITEM hItem, int& nImage, int& nSelectedImage) const;
  // Whether the item shows an expand button (cChildren nonzero).
  BOOL ItemHasChildren(HTREEITEM hItem) const;
  // bTextOnly: the rectangle of the text alone; FALSE if the item is not visible.
  BOOL GetItemRect(HTREEITEM hItem, LPRECT lpRect, BOOL bTextOnly) const;

  // Navigation (TVGN_ codes); NULL where there is no such item.
  HTREEITEM GetNextItem(HTREEITEM hItem, UINT nCode) const;
  HTREEITEM GetChildItem(HTREEITEM hItem) const;
  HTREEITEM GetNextSiblingItem(HTREEITEM hItem) const;
  HTREEITEM GetPrevSiblingItem(HTREEITEM hItem) const;
  HTREEITEM GetParentItem(HTREEITEM hItem) const;
  HTREEITEM GetRootItem() const;
  HTREEITEM GetSelectedItem() const;
  HTREEITEM GetFirstVisibleItem() const;

  BOOL SelectItem(HTREEITEM hItem);
  // TVE_EXPAND, TVE_COLLAPSE or TVE_TOGGLE.
  BOOL Expand(HTREEITEM hItem, UINT nCode);
  BOOL EnsureVisible(HTREEITEM hItem);
  // The item at a point of the client area; *pFlags receives the TVHT_ flags.
  HTREEITEM HitTest(CPoint pt, UINT* pFlags = NULL) const;
};
