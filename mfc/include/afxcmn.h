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
  BOOL SetItemText(int nItem, int nSubItem, LPCTSTR lpszText);
  CString GetItemText(int nItem, int nSubItem) const;
  BOOL DeleteAllItems();
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
