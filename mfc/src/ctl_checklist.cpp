// CCheckListBox: an owner-drawn list box with a check box before every item.
//
// The check and enabled state of an item live in a small block that the list
// makes on first need and puts into the item's Win32 item data; the caller's
// own item data moves into that block, and LB_GETITEMDATA/LB_SETITEMDATA
// answer with it, so the caller never sees the block. Every block is also
// kept in a set of the list's own: it is freed when its item goes (the parent
// hands WM_DELETEITEM back to the list) and, whatever the parent does, when
// the list's window goes.
#include "afxpriv.h"

#include <algorithm>
#include <unordered_set>

struct AFX_CHECK_DATA {
  int m_nCheck = 0;
  BOOL m_bEnabled = TRUE;
  DWORD_PTR m_dwUserData = 0;
};

struct AFX_CHECKLIST_STATE {
  std::unordered_set<AFX_CHECK_DATA*> m_blocks;
  ~AFX_CHECKLIST_STATE() {
    for (AFX_CHECK_DATA* p : m_blocks) delete p;
  }
};

namespace {

const int kBox = 13;                     // side of the drawn box, in pixels
const int kBoxMargin = 2;                // room left and right of it
const int kCheckCell = kBox + 2 * kBoxMargin;  // the strip of the item that belongs to the box

} // namespace

IMPLEMENT_DYNAMIC(CCheckListBox, CListBox)

BEGIN_MESSAGE_MAP(CCheckListBox, CListBox)
  ON_WM_CREATE()
  ON_WM_DESTROY()
  ON_WM_LBUTTONDOWN()
  ON_WM_LBUTTONDBLCLK()
  ON_WM_KEYDOWN()
  ON_MESSAGE(WM_SETFONT, OnSetFont)
  ON_MESSAGE(LB_GETITEMDATA, OnLBGetItemData)
  ON_MESSAGE(LB_SETITEMDATA, OnLBSetItemData)
END_MESSAGE_MAP()

CCheckListBox::CCheckListBox() : m_nStyle(BS_AUTOCHECKBOX), m_pState(new AFX_CHECKLIST_STATE) {}

CCheckListBox::~CCheckListBox() {
  // Destroyed here, while the blocks can still be given back to the items;
  // CWnd's destructor would destroy the window without this class's handlers.
  if (m_hWnd != NULL && CWnd::FromHandlePermanent(m_hWnd) == this) DestroyWindow();
  delete m_pState;
}

BOOL CCheckListBox::Create(DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID) {
  ASSERT(dwStyle & (LBS_OWNERDRAWFIXED | LBS_OWNERDRAWVARIABLE));
  ASSERT(dwStyle & LBS_HASSTRINGS);
  return CListBox::Create(dwStyle, rect, pParentWnd, nID);
}

// ---------------------------------------------------------------------------
// Check and enabled state
// ---------------------------------------------------------------------------

void CCheckListBox::SetCheckStyle(UINT nStyle) {
  ASSERT(nStyle == BS_CHECKBOX || nStyle == BS_AUTOCHECKBOX || nStyle == BS_3STATE || nStyle == BS_AUTO3STATE);
  m_nStyle = nStyle;
}

UINT CCheckListBox::GetCheckStyle() const { return m_nStyle; }

AFX_CHECK_DATA* CCheckListBox::Known(DWORD_PTR d) const {
  AFX_CHECK_DATA* p = reinterpret_cast<AFX_CHECK_DATA*>(d);
  return m_pState->m_blocks.count(p) != 0 ? p : NULL;
}

AFX_CHECK_DATA* CCheckListBox::CheckData(int nIndex, BOOL bCreate) {
  if (m_hWnd == NULL || nIndex < 0 || nIndex >= (int)DefWindowProc(LB_GETCOUNT, 0, 0)) return NULL;
  LRESULT raw = DefWindowProc(LB_GETITEMDATA, (WPARAM)nIndex, 0);
  AFX_CHECK_DATA* p = Known((DWORD_PTR)raw);
  if (p != NULL || !bCreate) return p;
  p = new AFX_CHECK_DATA;
  p->m_dwUserData = raw == LB_ERR ? 0 : (DWORD_PTR)raw;  // a value set before the list was ours
  m_pState->m_blocks.insert(p);
  if (DefWindowProc(LB_SETITEMDATA, (WPARAM)nIndex, (LPARAM)p) == LB_ERR) {
    m_pState->m_blocks.erase(p);
    delete p;
    return NULL;
  }
  return p;
}

void CCheckListBox::SetCheck(int nIndex, int nCheck) {
  ASSERT(nCheck >= 0 && nCheck <= 2);
  AFX_CHECK_DATA* p = CheckData(nIndex, TRUE);
  if (p == NULL || p->m_nCheck == nCheck) return;
  p->m_nCheck = nCheck;
  InvalidateCheck(nIndex);
}

int CCheckListBox::GetCheck(int nIndex) {
  AFX_CHECK_DATA* p = CheckData(nIndex, FALSE);
  return p != NULL ? p->m_nCheck : 0;
}

void CCheckListBox::Enable(int nIndex, BOOL bEnabled) {
  AFX_CHECK_DATA* p = CheckData(nIndex, TRUE);
  bEnabled = bEnabled ? TRUE : FALSE;
  if (p == NULL || p->m_bEnabled == bEnabled) return;
  p->m_bEnabled = bEnabled;
  CRect rc;
  if (GetItemRect(nIndex, &rc) != LB_ERR) InvalidateRect(&rc, FALSE);  // box and text change colour
}

BOOL CCheckListBox::IsEnabled(int nIndex) {
  AFX_CHECK_DATA* p = CheckData(nIndex, FALSE);
  return p != NULL ? p->m_bEnabled : TRUE;
}

void CCheckListBox::InvalidateCheck(int nIndex) {
  CRect rc;
  if (GetItemRect(nIndex, &rc) == LB_ERR) return;
  rc.right = rc.left + kCheckCell;
  InvalidateRect(&rc, FALSE);
}

void CCheckListBox::SetSelectionCheck(int nCheck) {
  if (!(GetStyle() & (LBS_MULTIPLESEL | LBS_EXTENDEDSEL))) return;
  int nSel = GetSelCount();
  if (nSel <= 0) return;
  CArray<int, int> items;
  items.SetSize(nSel);
  nSel = GetSelItems(nSel, items.GetData());
  for (int i = 0; i < nSel; i++)
    if (IsEnabled(items[i])) SetCheck(items[i], nCheck);
}

// ---------------------------------------------------------------------------
// Item data: the caller's value, not the block
// ---------------------------------------------------------------------------

LRESULT CCheckListBox::OnLBGetItemData(WPARAM wParam, LPARAM) {
  LRESULT raw = DefWindowProc(LB_GETITEMDATA, wParam, 0);
  if (raw == LB_ERR) return LB_ERR;
  AFX_CHECK_DATA* p = Known((DWORD_PTR)raw);
  return p != NULL ? (LRESULT)p->m_dwUserData : raw;
}

LRESULT CCheckListBox::OnLBSetItemData(WPARAM wParam, LPARAM lParam) {
  AFX_CHECK_DATA* p = CheckData((int)wParam, TRUE);
  if (p == NULL) return LB_ERR;
  p->m_dwUserData = (DWORD_PTR)lParam;
  return LB_OKAY;
}

// ---------------------------------------------------------------------------
// Window life
// ---------------------------------------------------------------------------

int CCheckListBox::CalcMinimumItemHeight() {
  CClientDC dc(this);
  CFont* pFont = GetFont();
  CFont* pOld = pFont != NULL ? dc.SelectObject(pFont) : NULL;
  TEXTMETRIC tm;
  dc.GetTextMetrics(&tm);
  if (pOld != NULL) dc.SelectObject(pOld);
  return std::max((int)tm.tmHeight, kBox + 2);
}

void CCheckListBox::PreSubclassWindow() {
  CListBox::PreSubclassWindow();
  // Subclassed from a dialog: the list exists with its font. (During creation
  // the list does not answer yet; OnCreate sets the height then.)
  if (GetStyle() & LBS_OWNERDRAWFIXED) SetItemHeight(0, CalcMinimumItemHeight());
}

int CCheckListBox::OnCreate(LPCREATESTRUCT lpCreateStruct) {
  if (CListBox::OnCreate(lpCreateStruct) == -1) return -1;
  if (GetStyle() & LBS_OWNERDRAWFIXED) SetItemHeight(0, CalcMinimumItemHeight());
  return 0;
}

LRESULT CCheckListBox::OnSetFont(WPARAM, LPARAM) {
  LRESULT result = Default();
  // The list box keeps the height of owner-drawn items through a new font.
  if (GetStyle() & LBS_OWNERDRAWFIXED) SetItemHeight(0, CalcMinimumItemHeight());
  return result;
}

void CCheckListBox::OnDestroy() {
  // The items go with the window: each gets the caller's value back before,
  // so WM_DELETEITEM carries that value as with any list box, and no block
  // outlives the window even under a parent that keeps WM_DELETEITEM.
  int nCount = (int)DefWindowProc(LB_GETCOUNT, 0, 0);
  for (int i = 0; i < nCount; i++) {
    AFX_CHECK_DATA* p = Known((DWORD_PTR)DefWindowProc(LB_GETITEMDATA, (WPARAM)i, 0));
    if (p == NULL) continue;
    DefWindowProc(LB_SETITEMDATA, (WPARAM)i, (LPARAM)p->m_dwUserData);
    m_pState->m_blocks.erase(p);
    delete p;
  }
  CListBox::OnDestroy();
}

// ---------------------------------------------------------------------------
// Owner draw: the parent hands the messages back here
// ---------------------------------------------------------------------------

BOOL CCheckListBox::OnChildNotify(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* pResult) {
  LRESULT result = TRUE;
  switch (message) {
  case WM_DRAWITEM:
    PreDrawItem((LPDRAWITEMSTRUCT)lParam);
    break;
  case WM_MEASUREITEM:
    PreMeasureItem((LPMEASUREITEMSTRUCT)lParam);
    break;
  case WM_COMPAREITEM:
    result = PreCompareItem((LPCOMPAREITEMSTRUCT)lParam);
    break;
  case WM_DELETEITEM:
    PreDeleteItem((LPDELETEITEMSTRUCT)lParam);
    break;
  default:
    return CListBox::OnChildNotify(message, wParam, lParam, pResult);
  }
  if (pResult != NULL) *pResult = result;
  return TRUE;
}

CRect CCheckListBox::OnGetCheckPosition(CRect rectItem, CRect rectCheckBox) {
  (void)rectItem;
  return rectCheckBox;
}

void CCheckListBox::PreDrawItem(LPDRAWITEMSTRUCT lpDrawItemStruct) {
  DRAWITEMSTRUCT dis = *lpDrawItemStruct;
  int nIndex = (int)dis.itemID;
  if (nIndex >= 0) {
    AFX_CHECK_DATA* p = Known(dis.itemData);
    int nCheck = p != NULL ? p->m_nCheck : 0;
    BOOL bEnabled = (p == NULL || p->m_bEnabled) && IsWindowEnabled();
    if (p != NULL) dis.itemData = p->m_dwUserData;
    if (dis.itemAction & (ODA_DRAWENTIRE | ODA_SELECT)) {
      CDC* pDC = CDC::FromHandle(dis.hDC);
      CRect rectItem(dis.rcItem);
      CRect rectCell(rectItem.left, rectItem.top, rectItem.left + kCheckCell, rectItem.bottom);
      pDC->FillSolidRect(&rectCell, ::GetSysColor(COLOR_WINDOW));
      int top = rectItem.top + (rectItem.Height() - kBox) / 2;
      CRect rectBox(rectItem.left + kBoxMargin, top, rectItem.left + kBoxMargin + kBox, top + kBox);
      rectBox = OnGetCheckPosition(rectItem, rectBox);
      UINT state = DFCS_BUTTONCHECK;
      if (nCheck == 1) state |= DFCS_CHECKED;
      if (nCheck == 2) state = DFCS_BUTTON3STATE | DFCS_CHECKED;
      if (!bEnabled) state |= DFCS_INACTIVE;
      ::DrawFrameControl(dis.hDC, &rectBox, DFC_BUTTON, state);
    }
    dis.rcItem.left += kCheckCell;
  }
  DrawItem(&dis);
}

void CCheckListBox::DrawItem(LPDRAWITEMSTRUCT lpDrawItemStruct) {
  // Lists without strings draw their items in an override.
  ASSERT(GetStyle() & LBS_HASSTRINGS);
  CDC* pDC = CDC::FromHandle(lpDrawItemStruct->hDC);
  CRect rc(lpDrawItemStruct->rcItem);
  int nIndex = (int)lpDrawItemStruct->itemID;
  BOOL bFocus = (lpDrawItemStruct->itemState & ODS_FOCUS) != 0;
  if (nIndex < 0 || lpDrawItemStruct->itemAction == ODA_FOCUS) {
    // Only the focus changes: the dotted frame is inverted on or off.
    if (nIndex < 0 ? bFocus : TRUE) pDC->DrawFocusRect(&rc);
    return;
  }
  BOOL bEnabled = IsWindowEnabled() && IsEnabled(nIndex);
  BOOL bSelected = (lpDrawItemStruct->itemState & ODS_SELECTED) != 0;
  pDC->FillSolidRect(&rc, ::GetSysColor(bSelected ? COLOR_HIGHLIGHT : COLOR_WINDOW));
  COLORREF clrText = ::GetSysColor(!bEnabled ? COLOR_GRAYTEXT : bSelected ? COLOR_HIGHLIGHTTEXT : COLOR_WINDOWTEXT);
  COLORREF clrOld = pDC->SetTextColor(clrText);
  int nOldMode = pDC->SetBkMode(TRANSPARENT);
  CString text;
  GetText(nIndex, text);
  CRect rectText(rc);
  rectText.left += 2;
  pDC->DrawText(text, &rectText, DT_SINGLELINE | DT_VCENTER | DT_NOPREFIX);
  pDC->SetBkMode(nOldMode);
  pDC->SetTextColor(clrOld);
  if (bFocus) pDC->DrawFocusRect(&rc);
}

void CCheckListBox::PreMeasureItem(LPMEASUREITEMSTRUCT lpMeasureItemStruct) {
  MEASUREITEMSTRUCT mis = *lpMeasureItemStruct;
  if (AFX_CHECK_DATA* p = Known(mis.itemData)) mis.itemData = p->m_dwUserData;
  MeasureItem(&mis);
  lpMeasureItemStruct->itemHeight = (UINT)std::max((int)mis.itemHeight, CalcMinimumItemHeight());
  lpMeasureItemStruct->itemWidth = mis.itemWidth;
}

void CCheckListBox::MeasureItem(LPMEASUREITEMSTRUCT lpMeasureItemStruct) {
  lpMeasureItemStruct->itemHeight = CalcMinimumItemHeight();
}

int CCheckListBox::PreCompareItem(LPCOMPAREITEMSTRUCT lpCompareItemStruct) {
  COMPAREITEMSTRUCT cis = *lpCompareItemStruct;
  if (AFX_CHECK_DATA* p = Known(cis.itemData1)) cis.itemData1 = p->m_dwUserData;
  if (AFX_CHECK_DATA* p = Known(cis.itemData2)) cis.itemData2 = p->m_dwUserData;
  return CompareItem(&cis);
}

void CCheckListBox::PreDeleteItem(LPDELETEITEMSTRUCT lpDeleteItemStruct) {
  DELETEITEMSTRUCT dis = *lpDeleteItemStruct;
  if (AFX_CHECK_DATA* p = Known(dis.itemData)) {
    dis.itemData = p->m_dwUserData;
    m_pState->m_blocks.erase(p);
    delete p;
  }
  DeleteItem(&dis);
}

// ---------------------------------------------------------------------------
// The user's input
// ---------------------------------------------------------------------------

int CCheckListBox::CheckFromPoint(CPoint point, BOOL& bInCheck) {
  bInCheck = FALSE;
  int nCount = GetCount();
  if (nCount <= 0) return -1;
  BOOL bOutside = FALSE;
  int nIndex = (int)ItemFromPoint(point, bOutside);
  CRect rc;
  if (nIndex < 0 || nIndex >= nCount || GetItemRect(nIndex, &rc) == LB_ERR || !rc.PtInRect(point)) return -1;
  bInCheck = point.x < rc.left + kCheckCell;
  return nIndex;
}

bool CCheckListBox::Toggle(int nIndex) {
  // The plain styles leave the check to the program, which hears of the
  // click or key through CLBN_CHKCHANGE.
  if (m_nStyle == BS_CHECKBOX || m_nStyle == BS_3STATE) return false;
  int nModulo = m_nStyle == BS_AUTO3STATE ? 3 : 2;
  SetCheck(nIndex, (GetCheck(nIndex) + 1) % nModulo);
  return true;
}

void CCheckListBox::NotifyCheckChange() {
  HWND hWndParent = ::GetParent(m_hWnd);
  if (hWndParent != NULL)
    ::SendMessageA(hWndParent, WM_COMMAND, MAKEWPARAM(GetDlgCtrlID(), CLBN_CHKCHANGE), (LPARAM)m_hWnd);
}

void CCheckListBox::OnLButtonDown(UINT nFlags, CPoint point) {
  (void)nFlags;
  SetFocus();
  BOOL bInCheck = FALSE;
  int nIndex = CheckFromPoint(point, bInCheck);
  if (nIndex >= 0 && !IsEnabled(nIndex)) return;  // a disabled item takes no clicks
  if (nIndex < 0 || !bInCheck) {
    Default();
    return;
  }
  bool bToggled = Toggle(nIndex);
  HWND hWnd = m_hWnd;
  Default();  // the list's own selection follows the click as well
  if (!::IsWindow(hWnd)) return;
  if (bToggled && GetSel(nIndex) > 0) SetSelectionCheck(GetCheck(nIndex));
  NotifyCheckChange();
}

void CCheckListBox::OnLButtonDblClk(UINT nFlags, CPoint point) {
  // The second click of a double click on a box counts as a click of its own.
  BOOL bInCheck = FALSE;
  if (CheckFromPoint(point, bInCheck) >= 0 && bInCheck) {
    OnLButtonDown(nFlags, point);
    return;
  }
  Default();
}

void CCheckListBox::OnKeyDown(UINT nChar, UINT nRepCnt, UINT nFlags) {
  (void)nRepCnt;
  (void)nFlags;
  if (nChar != VK_SPACE) {
    Default();
    return;
  }
  int nIndex = GetCaretIndex();
  if (nIndex < 0 || nIndex >= GetCount() || !IsEnabled(nIndex)) return;
  if (Toggle(nIndex) && GetSel(nIndex) > 0) SetSelectionCheck(GetCheck(nIndex));
  NotifyCheckChange();
}
