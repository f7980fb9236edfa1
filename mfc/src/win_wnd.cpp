// CWnd: the handle map, window creation through the creation hook, the window
// procedure of every CWnd and the dispatch of messages through message maps,
// including the reflection of notifications to the controls that sent them.
#include "afxpriv.h"
#include "win_private.h"

#include <exception>

IMPLEMENT_DYNCREATE(CWnd, CCmdTarget)

BEGIN_MESSAGE_MAP(CWnd, CCmdTarget)
  ON_WM_NCDESTROY()
END_MESSAGE_MAP()

#ifndef GET_X_LPARAM
#define GET_X_LPARAM(lp) ((int)(short)LOWORD(lp))
#define GET_Y_LPARAM(lp) ((int)(short)HIWORD(lp))
#endif

namespace {

// The data of a reflected WM_CTLCOLOR*.
struct AFX_CTLCOLOR {
  HWND hWnd;
  HDC hDC;
  UINT nCtlType;
};

const char kDefaultClass[] = "QoAfxWnd";

LRESULT CALLBACK AfxCbtFilterHook(int code, WPARAM wParam, LPARAM lParam) {
  AFX_THREAD_STATE* pState = AfxGetThreadState();
  if (code == HCBT_CREATEWND && pState->m_pWndInit != NULL) {
    HWND hWnd = (HWND)wParam;
    // The input method's own window may be made first on a thread: not ours.
    char szClass[16];
    if (::GetClassNameA(hWnd, szClass, sizeof(szClass)) && lstrcmpiA(szClass, "IME") == 0)
      return ::CallNextHookEx(pState->m_hHookCbt, code, wParam, lParam);
    CWnd* pWndInit = pState->m_pWndInit;
    pState->m_pWndInit = NULL;
    pWndInit->Attach(hWnd);
    pWndInit->PreSubclassWindow();
    WNDPROC pfnOld = (WNDPROC)::SetWindowLongPtrA(hWnd, GWLP_WNDPROC, (LONG_PTR)&AfxWndProc);
    if (pfnOld != &AfxWndProc) *pWndInit->GetSuperWndProcAddr() = pfnOld;
  }
  return ::CallNextHookEx(pState->m_hHookCbt, code, wParam, lParam);
}

// The control that a parent's message is about, for reflection; NULL if none.
HWND ChildOfMessage(HWND hWndParent, UINT message, WPARAM wParam, LPARAM lParam) {
  switch (message) {
  case WM_DRAWITEM: {
    LPDRAWITEMSTRUCT p = (LPDRAWITEMSTRUCT)lParam;
    return p->CtlType == ODT_MENU ? NULL : p->hwndItem;
  }
  case WM_MEASUREITEM: {
    LPMEASUREITEMSTRUCT p = (LPMEASUREITEMSTRUCT)lParam;
    return p->CtlType == ODT_MENU ? NULL : ::GetDlgItem(hWndParent, p->CtlID);
  }
  case WM_COMPAREITEM:
    return ((LPCOMPAREITEMSTRUCT)lParam)->hwndItem;
  case WM_DELETEITEM:
    return ((LPDELETEITEMSTRUCT)lParam)->hwndItem;
  case WM_CTLCOLORMSGBOX:
  case WM_CTLCOLOREDIT:
  case WM_CTLCOLORLISTBOX:
  case WM_CTLCOLORBTN:
  case WM_CTLCOLORDLG:
  case WM_CTLCOLORSCROLLBAR:
  case WM_CTLCOLORSTATIC:
  case WM_HSCROLL:
  case WM_VSCROLL:
  case WM_VKEYTOITEM:
  case WM_CHARTOITEM:
    return (HWND)lParam;
  case WM_PARENTNOTIFY:
    if (LOWORD(wParam) == WM_CREATE || LOWORD(wParam) == WM_DESTROY) return (HWND)lParam;
    return NULL;
  }
  return NULL;
}

// Gives the permanent CWnd of hWndChild the chance to handle its parent's message.
BOOL SendChildNotify(HWND hWndParent, HWND hWndChild, UINT message, WPARAM wParam, LPARAM lParam,
                     LRESULT* pResult) {
  if (hWndChild == NULL || hWndChild == hWndParent) return FALSE;
  CWnd* pChild = CWnd::FromHandlePermanent(hWndChild);
  if (pChild == NULL) return FALSE;
  return pChild->OnChildNotify(message, wParam, lParam, pResult);
}

LRESULT ForeignExceptionResult(UINT nMsg) { return nMsg == WM_CREATE ? -1 : 0; }

} // namespace

// ---------------------------------------------------------------------------
// The window procedure
// ---------------------------------------------------------------------------

void AFXAPI AfxHookWindowCreate(CWnd* pWnd) {
  AFX_THREAD_STATE* pState = AfxGetThreadState();
  if (pState->m_hHookCbt == NULL) {
    pState->m_hHookCbt = ::SetWindowsHookExA(WH_CBT, &AfxCbtFilterHook, NULL, ::GetCurrentThreadId());
    if (pState->m_hHookCbt == NULL) AfxThrowMemoryException();
  }
  ASSERT(pWnd != NULL && pWnd->m_hWnd == NULL);
  ASSERT(pState->m_pWndInit == NULL);
  pState->m_pWndInit = pWnd;
}

BOOL AFXAPI AfxUnhookWindowCreate() {
  AFX_THREAD_STATE* pState = AfxGetThreadState();
  if (pState->m_pWndInit != NULL) {
    pState->m_pWndInit = NULL;
    return FALSE;
  }
  return TRUE;
}

LRESULT CALLBACK AfxWndProc(HWND hWnd, UINT nMsg, WPARAM wParam, LPARAM lParam) {
  CWnd* pWnd = CWnd::FromHandlePermanent(hWnd);
  if (pWnd == NULL || pWnd->m_hWnd != hWnd) return ::DefWindowProcA(hWnd, nMsg, wParam, lParam);
  return AfxCallWndProc(pWnd, hWnd, nMsg, wParam, lParam);
}

LRESULT AFXAPI AfxCallWndProc(CWnd* pWnd, HWND hWnd, UINT nMsg, WPARAM wParam, LPARAM lParam) {
  AFX_THREAD_STATE* pState = AfxGetThreadState();
  MSG oldState = pState->m_lastSentMsg;
  pState->m_lastSentMsg.hwnd = hWnd;
  pState->m_lastSentMsg.message = nMsg;
  pState->m_lastSentMsg.wParam = wParam;
  pState->m_lastSentMsg.lParam = lParam;

  LRESULT lResult = 0;
  // No exception may unwind through the Win32 frames that called us.
  try {
    lResult = pWnd->WindowProc(nMsg, wParam, lParam);
  } catch (CException* e) {
    MSG msg = pState->m_lastSentMsg;
    lResult = AfxProcessWndProcException(e, &msg);
    e->Delete();
  } catch (std::exception& e) {
    AfxReportForeignException(e.what());
    lResult = ForeignExceptionResult(nMsg);
  } catch (...) {
    AfxReportForeignException("unbekannte Ausnahme");
    lResult = ForeignExceptionResult(nMsg);
  }

  if (nMsg == WM_NCDESTROY && CWnd::FromHandlePermanent(hWnd) == pWnd) {
    // The handler did not end the object's tie to the window: do it now.
    try {
      pWnd->Detach();
      pWnd->PostNcDestroy();
    } catch (...) {
    }
  }
  pState->m_lastSentMsg = oldState;
  return lResult;
}

// ---------------------------------------------------------------------------
// Construction, handle map, subclassing
// ---------------------------------------------------------------------------

CWnd::CWnd() : m_hWnd(NULL), m_pfnSuper(NULL), m_nFlags(0), m_nModalResult(0) {}

CWnd::~CWnd() {
  if (m_hWnd != NULL && !(m_nFlags & WF_TEMPORARY) && FromHandlePermanent(m_hWnd) == this) {
    // A window still alive when its object goes: destroy it (derived handlers
    // no longer run at this point).
    DestroyWindow();
  }
}

CWnd* PASCAL CWnd::FromHandle(HWND hWnd) { return AfxGetThreadState()->m_wndMap.FromHandle(hWnd); }

CWnd* PASCAL CWnd::FromHandlePermanent(HWND hWnd) {
  if (hWnd == NULL) return NULL;
  return AfxGetThreadState()->m_wndMap.LookupPermanent(hWnd);
}

BOOL CWnd::Attach(HWND hWndNew) {
  ASSERT(m_hWnd == NULL);
  if (hWndNew == NULL) return FALSE;
  ASSERT(FromHandlePermanent(hWndNew) == NULL);
  AfxGetThreadState()->m_wndMap.SetPermanent(hWndNew, this);
  m_hWnd = hWndNew;
  return TRUE;
}

HWND CWnd::Detach() {
  HWND hWnd = m_hWnd;
  if (hWnd != NULL) {
    AFX_THREAD_STATE* pState = AfxGetThreadState();
    if (pState->m_wndMap.LookupPermanent(hWnd) == this) pState->m_wndMap.RemoveHandle(hWnd);
  }
  m_hWnd = NULL;
  return hWnd;
}

WNDPROC* CWnd::GetSuperWndProcAddr() { return &m_pfnSuper; }

void CWnd::PreSubclassWindow() {}

BOOL CWnd::SubclassWindow(HWND hWnd) {
  if (!::IsWindow(hWnd) || !Attach(hWnd)) return FALSE;
  PreSubclassWindow();
  WNDPROC pfnOld = (WNDPROC)::SetWindowLongPtrA(hWnd, GWLP_WNDPROC, (LONG_PTR)&AfxWndProc);
  if (pfnOld == &AfxWndProc) {
    // Already the window of another CWnd: refuse.
    Detach();
    return FALSE;
  }
  *GetSuperWndProcAddr() = pfnOld;
  return TRUE;
}

BOOL CWnd::SubclassDlgItem(UINT nID, CWnd* pParent) {
  ASSERT(pParent != NULL && ::IsWindow(pParent->m_hWnd));
  HWND hWndControl = ::GetDlgItem(pParent->m_hWnd, nID);
  return hWndControl != NULL && SubclassWindow(hWndControl);
}

HWND CWnd::UnsubclassWindow() {
  ASSERT(::IsWindow(m_hWnd));
  WNDPROC* lplpfn = GetSuperWndProcAddr();
  if (*lplpfn != NULL) ::SetWindowLongPtrA(m_hWnd, GWLP_WNDPROC, (LONG_PTR)*lplpfn);
  *lplpfn = NULL;
  return Detach();
}

// ---------------------------------------------------------------------------
// Creation and destruction
// ---------------------------------------------------------------------------

BOOL CWnd::PreCreateWindow(CREATESTRUCT& cs) {
  if (cs.lpszClass == NULL) {
    WNDCLASSA wc;
    HINSTANCE hInst = AfxGetInstanceHandle();
    if (!::GetClassInfoA(hInst, kDefaultClass, &wc)) {
      memset(&wc, 0, sizeof(wc));
      wc.style = CS_DBLCLKS | CS_HREDRAW | CS_VREDRAW;
      wc.lpfnWndProc = ::DefWindowProcA;
      wc.hInstance = hInst;
      wc.hCursor = ::LoadCursorA(NULL, IDC_ARROW);
      wc.hbrBackground = (HBRUSH)(COLOR_WINDOW + 1);
      wc.lpszClassName = kDefaultClass;
      if (!::RegisterClassA(&wc)) return FALSE;
    }
    cs.lpszClass = kDefaultClass;
  }
  return TRUE;
}

BOOL CWnd::CreateEx(DWORD dwExStyle, LPCTSTR lpszClassName, LPCTSTR lpszWindowName, DWORD dwStyle, int x, int y,
                    int nWidth, int nHeight, HWND hWndParent, HMENU nIDorHMenu, LPVOID lpParam) {
  ASSERT(m_hWnd == NULL);
  CREATESTRUCTA cs;
  cs.dwExStyle = dwExStyle;
  cs.lpszClass = lpszClassName;
  cs.lpszName = lpszWindowName;
  cs.style = dwStyle;
  cs.x = x;
  cs.y = y;
  cs.cx = nWidth;
  cs.cy = nHeight;
  cs.hwndParent = hWndParent;
  cs.hMenu = nIDorHMenu;
  cs.hInstance = AfxGetInstanceHandle();
  cs.lpCreateParams = lpParam;
  if (!PreCreateWindow(cs)) {
    PostNcDestroy();
    return FALSE;
  }
  qownd::ComCtl();  // the control classes, before the first window
  AfxHookWindowCreate(this);
  HWND hWnd = ::CreateWindowExA(cs.dwExStyle, cs.lpszClass, cs.lpszName, cs.style, cs.x, cs.y, cs.cx, cs.cy,
                                cs.hwndParent, cs.hMenu, cs.hInstance, cs.lpCreateParams);
  if (!AfxUnhookWindowCreate()) {
    // The window was never made (unknown class, ...): the object is done with.
    PostNcDestroy();
    return FALSE;
  }
  return hWnd != NULL;
}

BOOL CWnd::CreateEx(DWORD dwExStyle, LPCTSTR lpszClassName, LPCTSTR lpszWindowName, DWORD dwStyle, const RECT& rect,
                    CWnd* pParentWnd, UINT nID, LPVOID lpParam) {
  return CreateEx(dwExStyle, lpszClassName, lpszWindowName, dwStyle, rect.left, rect.top, rect.right - rect.left,
                  rect.bottom - rect.top, pParentWnd->GetSafeHwnd(), (HMENU)(UINT_PTR)nID, lpParam);
}

BOOL CWnd::Create(LPCTSTR lpszClassName, LPCTSTR lpszWindowName, DWORD dwStyle, const RECT& rect, CWnd* pParentWnd,
                  UINT nID, void* pContext) {
  ASSERT(pParentWnd != NULL); // a child window
  ASSERT(!(dwStyle & WS_POPUP));
  return CreateEx(0, lpszClassName, lpszWindowName, dwStyle | WS_CHILD, rect, pParentWnd, nID, pContext);
}

BOOL CWnd::DestroyWindow() {
  if (m_hWnd == NULL) return FALSE;
  BOOL bPermanent = FromHandlePermanent(m_hWnd) == this;
  BOOL bTemporary = (m_nFlags & WF_TEMPORARY) != 0;
  HWND hWnd = m_hWnd;
  BOOL bResult = ::DestroyWindow(hWnd);
  // A permanent object may be gone now (PostNcDestroy); only others are touched.
  if (!bPermanent && !bTemporary) m_hWnd = NULL;
  return bResult;
}

void CWnd::PostNcDestroy() {}

void CWnd::OnNcDestroy() {
  CWinThread* pThread = AfxGetThread();
  if (pThread != NULL) {
    if (pThread->m_pMainWnd == this) {
      // The main window ends the thread's message loop.
      AfxPostQuitMessage(0);
      pThread->m_pMainWnd = NULL;
    }
    if (pThread->m_pActiveWnd == this) pThread->m_pActiveWnd = NULL;
  }
  WNDPROC pfnWndProc = (WNDPROC)::GetWindowLongPtrA(m_hWnd, GWLP_WNDPROC);
  Default();
  if ((WNDPROC)::GetWindowLongPtrA(m_hWnd, GWLP_WNDPROC) == pfnWndProc) {
    WNDPROC pfnSuper = *GetSuperWndProcAddr();
    if (pfnSuper != NULL) ::SetWindowLongPtrA(m_hWnd, GWLP_WNDPROC, (LONG_PTR)pfnSuper);
  }
  Detach();
  PostNcDestroy();
}

// ---------------------------------------------------------------------------
// Dispatch
// ---------------------------------------------------------------------------

LRESULT CWnd::WindowProc(UINT message, WPARAM wParam, LPARAM lParam) {
  LRESULT lResult = 0;
  if (!OnWndMsg(message, wParam, lParam, &lResult)) lResult = DefWindowProc(message, wParam, lParam);
  return lResult;
}

LRESULT CWnd::DefWindowProc(UINT message, WPARAM wParam, LPARAM lParam) {
  WNDPROC pfnSuper = *GetSuperWndProcAddr();
  if (pfnSuper != NULL) return ::CallWindowProcA(pfnSuper, m_hWnd, message, wParam, lParam);
  return ::DefWindowProcA(m_hWnd, message, wParam, lParam);
}

LRESULT CWnd::Default() {
  const MSG& msg = AfxGetThreadState()->m_lastSentMsg;
  return DefWindowProc(msg.message, msg.wParam, msg.lParam);
}

const MSG* PASCAL CWnd::GetCurrentMessage() {
  AFX_THREAD_STATE* pState = AfxGetThreadState();
  pState->m_lastSentMsg.time = ::GetMessageTime();
  DWORD dwPos = ::GetMessagePos();
  pState->m_lastSentMsg.pt.x = GET_X_LPARAM(dwPos);
  pState->m_lastSentMsg.pt.y = GET_Y_LPARAM(dwPos);
  return &pState->m_lastSentMsg;
}

BOOL CWnd::OnWndMsg(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* pResult) {
  LRESULT lResult = 0;
  if (message == WM_COMMAND) {
    if (!OnCommand(wParam, lParam)) return FALSE;
    lResult = 1;
  } else if (message == WM_NOTIFY) {
    NMHDR* pNMHDR = (NMHDR*)lParam;
    if (pNMHDR->hwndFrom == NULL || !OnNotify(wParam, lParam, &lResult)) return FALSE;
  } else {
    // The control that caused the message handles it first (reflection).
    HWND hWndChild = ChildOfMessage(m_hWnd, message, wParam, lParam);
    if (hWndChild != NULL && SendChildNotify(m_hWnd, hWndChild, message, wParam, lParam, &lResult)) {
      if (pResult != NULL) *pResult = lResult;
      return TRUE;
    }
    UINT nKey = message;
    if (message >= WM_CTLCOLORMSGBOX && message <= WM_CTLCOLORSTATIC) nKey = WM_CTLCOLOR;
    const AFX_MSGMAP_ENTRY* lpEntry = AfxFindWindowMessage(GetMessageMap(), nKey);
    if (lpEntry == NULL) return FALSE;

    MessageMapFunctions mmf;
    mmf.pfn = lpEntry->pfn;
    UINT_PTR nSig = lpEntry->nMessage == 0xC000 ? (UINT_PTR)AfxSig_lwl : lpEntry->nSig;
    CPoint point(GET_X_LPARAM(lParam), GET_Y_LPARAM(lParam));
    switch (nSig) {
    case AfxSig_is:
      lResult = (this->*mmf.pfn_is)((LPCREATESTRUCT)lParam);
      break;
    case AfxSig_vv:
      (this->*mmf.pfn_vv)();
      break;
    case AfxSig_bv:
      lResult = (this->*mmf.pfn_bv)();
      break;
    case AfxSig_wv:
      lResult = (this->*mmf.pfn_wv)();
      break;
    case AfxSig_bD:
      lResult = (this->*mmf.pfn_bD)(CDC::FromHandle((HDC)wParam));
      break;
    case AfxSig_vwii:
      (this->*mmf.pfn_vwii)((UINT)wParam, (short)LOWORD(lParam), (short)HIWORD(lParam));
      break;
    case AfxSig_vii:
      (this->*mmf.pfn_vii)((short)LOWORD(lParam), (short)HIWORD(lParam));
      break;
    case AfxSig_vw:
      (this->*mmf.pfn_vw)((UINT)wParam);
      break;
    case AfxSig_vbw:
      (this->*mmf.pfn_vbw)((BOOL)wParam, (UINT)lParam);
      break;
    case AfxSig_vW:
      (this->*mmf.pfn_vW)(CWnd::FromHandle((HWND)wParam));
      break;
    case AfxSig_vwp:
      (this->*mmf.pfn_vwp)((UINT)wParam, point);
      break;
    case AfxSig_bwsp:
      lResult = (this->*mmf.pfn_bwsp)(LOWORD(wParam), (short)HIWORD(wParam), point);
      break;
    case AfxSig_vWp:
      (this->*mmf.pfn_vWp)(CWnd::FromHandle((HWND)wParam), point);
      break;
    case AfxSig_vwww:
      (this->*mmf.pfn_vwww)((UINT)wParam, LOWORD(lParam), HIWORD(lParam));
      break;
    case AfxSig_vww:
      (this->*mmf.pfn_vww)(LOWORD(wParam), HIWORD(wParam));
      break;
    case AfxSig_bWww:
      lResult = (this->*mmf.pfn_bWww)(CWnd::FromHandle((HWND)wParam), LOWORD(lParam), HIWORD(lParam));
      break;
    case AfxSig_wp:
      lResult = (this->*mmf.pfn_wp)(point);
      break;
    case AfxSig_vwwW:
      (this->*mmf.pfn_vwwW)(LOWORD(wParam), HIWORD(wParam), (CScrollBar*)CWnd::FromHandle((HWND)lParam));
      break;
    case AfxSig_vOWNER:
      (this->*mmf.pfn_vOWNER)((int)wParam, (void*)lParam);
      lResult = TRUE;
      break;
    case AfxSig_hDWw:
      lResult = (LRESULT)(this->*mmf.pfn_hDWw)(CDC::FromHandle((HDC)wParam), CWnd::FromHandle((HWND)lParam),
                                                message - WM_CTLCOLORMSGBOX);
      break;
    case AfxSig_hDw: {
      AFX_CTLCOLOR* pCtl = (AFX_CTLCOLOR*)lParam;
      HBRUSH hbr = (this->*mmf.pfn_hDw)(CDC::FromHandle(pCtl->hDC), pCtl->nCtlType);
      if (hbr == NULL) return FALSE; // the parent decides
      lResult = (LRESULT)hbr;
      break;
    }
    case AfxSig_vwWb:
      (this->*mmf.pfn_vwWb)(LOWORD(wParam), CWnd::FromHandle((HWND)lParam), (BOOL)HIWORD(wParam));
      break;
    case AfxSig_vbh:
      (this->*mmf.pfn_vbh)((BOOL)wParam, (DWORD)lParam);
      break;
    case AfxSig_vwl:
      (this->*mmf.pfn_vwl)((UINT)wParam, lParam);
      break;
    case AfxSig_vs:
      (this->*mmf.pfn_vs)((void*)lParam);
      lResult = TRUE;
      break;
    case AfxSig_vHDROP:
      (this->*mmf.pfn_vHDROP)((HDROP)wParam);
      break;
    case AfxSig_lwl:
      lResult = (this->*mmf.pfn_lwl)(wParam, lParam);
      break;
    default:
      ASSERT(FALSE); // a command entry filed under a window message
      return FALSE;
    }
  }
  if (pResult != NULL) *pResult = lResult;
  return TRUE;
}

BOOL CWnd::OnCommand(WPARAM wParam, LPARAM lParam) {
  UINT nID = LOWORD(wParam);
  HWND hWndCtrl = (HWND)lParam;
  int nCode = HIWORD(wParam);
  if (hWndCtrl == NULL) {
    // Menus and accelerators
    if (nID == 0) return FALSE;
    nCode = CN_COMMAND;
  } else {
    // Notifications while UpdateData fills the controls are not the user's doing.
    if (AfxGetThreadState()->m_hLockoutNotifyWindow == m_hWnd) return TRUE;
    // The control handles its own notification first.
    LRESULT lResult = 0;
    if (SendChildNotify(m_hWnd, hWndCtrl, WM_COMMAND, wParam, lParam, &lResult)) return TRUE;
    if (nID == 0) return FALSE;
  }
  return OnCmdMsg(nID, nCode, NULL, NULL);
}

BOOL CWnd::OnNotify(WPARAM wParam, LPARAM lParam, LRESULT* pResult) {
  (void)wParam;
  NMHDR* pNMHDR = (NMHDR*)lParam;
  HWND hWndCtrl = pNMHDR->hwndFrom;
  UINT nID = (UINT)pNMHDR->idFrom;
  int nCode = pNMHDR->code;
  if (AfxGetThreadState()->m_hLockoutNotifyWindow == m_hWnd) return TRUE;
  if (SendChildNotify(m_hWnd, hWndCtrl, WM_NOTIFY, wParam, lParam, pResult)) return TRUE;
  AFX_NOTIFY notify;
  notify.pResult = pResult;
  notify.pNMHDR = pNMHDR;
  return OnCmdMsg(nID, MAKELONG(nCode, WM_NOTIFY), &notify, NULL);
}

BOOL CWnd::OnCmdMsg(UINT nID, int nCode, void* pExtra, AFX_CMDHANDLERINFO* pHandlerInfo) {
  return CCmdTarget::OnCmdMsg(nID, nCode, pExtra, pHandlerInfo);
}

BOOL CWnd::OnChildNotify(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* pResult) {
  return ReflectChildNotify(message, wParam, lParam, pResult);
}

BOOL CWnd::ReflectChildNotify(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* pResult) {
  switch (message) {
  case WM_HSCROLL:
  case WM_VSCROLL:
  case WM_PARENTNOTIFY:
  case WM_DRAWITEM:
  case WM_MEASUREITEM:
  case WM_DELETEITEM:
  case WM_VKEYTOITEM:
  case WM_CHARTOITEM:
  case WM_COMPAREITEM:
    return CWnd::OnWndMsg(WM_REFLECT_BASE + message, wParam, lParam, pResult);
  case WM_COMMAND: {
    int nCode = HIWORD(wParam);
    if (CWnd::OnCmdMsg(0, MAKELONG(nCode, WM_REFLECT_BASE + WM_COMMAND), NULL, NULL)) {
      if (pResult != NULL) *pResult = 1;
      return TRUE;
    }
    return FALSE;
  }
  case WM_NOTIFY: {
    NMHDR* pNMHDR = (NMHDR*)lParam;
    LRESULT lDummy = 0;
    AFX_NOTIFY notify;
    notify.pResult = pResult != NULL ? pResult : &lDummy;
    notify.pNMHDR = pNMHDR;
    return CWnd::OnCmdMsg(0, MAKELONG(pNMHDR->code, WM_REFLECT_BASE + WM_NOTIFY), &notify, NULL);
  }
  }
  if (message >= WM_CTLCOLORMSGBOX && message <= WM_CTLCOLORSTATIC) {
    AFX_CTLCOLOR ctl;
    ctl.hWnd = m_hWnd;
    ctl.hDC = (HDC)wParam;
    ctl.nCtlType = message - WM_CTLCOLORMSGBOX;
    return CWnd::OnWndMsg(WM_REFLECT_BASE + WM_CTLCOLOR, 0, (LPARAM)&ctl, pResult);
  }
  return FALSE;
}

BOOL PASCAL CWnd::ReflectLastMsg(HWND hWndChild, LRESULT* pResult) {
  const MSG& msg = AfxGetThreadState()->m_lastSentMsg;
  return SendChildNotify(msg.hwnd, hWndChild, msg.message, msg.wParam, msg.lParam, pResult);
}

BOOL CWnd::PreTranslateMessage(MSG* pMsg) {
  (void)pMsg;
  return FALSE;
}

BOOL PASCAL CWnd::WalkPreTranslateTree(HWND hWndStop, MSG* pMsg) {
  for (HWND hWnd = pMsg->hwnd; hWnd != NULL; hWnd = ::GetParent(hWnd)) {
    CWnd* pWnd = CWnd::FromHandlePermanent(hWnd);
    if (pWnd != NULL && pWnd->PreTranslateMessage(pMsg)) return TRUE;
    if (hWnd == hWndStop) break;
  }
  return FALSE;
}

void CWnd::DoDataExchange(CDataExchange* pDX) { (void)pDX; }

BOOL CWnd::UpdateData(BOOL bSaveAndValidate) {
  ASSERT(::IsWindow(m_hWnd));
  CDataExchange dx(this, bSaveAndValidate);
  AFX_THREAD_STATE* pState = AfxGetThreadState();
  HWND hWndOldLockout = pState->m_hLockoutNotifyWindow;
  pState->m_hLockoutNotifyWindow = m_hWnd;
  BOOL bOK = FALSE;
  try {
    DoDataExchange(&dx);
    bOK = TRUE;
  } catch (CUserException* e) {
    // The user has been told; the focus is on the bad control.
    e->Delete();
  } catch (CException* e) {
    if (bSaveAndValidate) e->ReportError(MB_ICONSTOP, AFX_IDP_INTERNAL_FAILURE);
    e->Delete();
  }
  pState->m_hLockoutNotifyWindow = hWndOldLockout;
  return bOK;
}

// ---------------------------------------------------------------------------
// Modal loop
// ---------------------------------------------------------------------------

BOOL CWnd::ContinueModal() { return (m_nFlags & WF_CONTINUEMODAL) != 0; }

void CWnd::EndModalLoop(int nResult) {
  m_nModalResult = nResult;
  if (m_nFlags & WF_CONTINUEMODAL) {
    m_nFlags &= ~WF_CONTINUEMODAL;
    PostMessage(WM_NULL); // wakes the loop
  }
}

int CWnd::RunModalLoop(DWORD dwFlags) {
  ASSERT(::IsWindow(m_hWnd));
  ASSERT(!(m_nFlags & WF_MODALLOOP));
  BOOL bIdle = TRUE;
  LONG lIdleCount = 0;
  BOOL bShowIdle = (dwFlags & MLF_SHOWONIDLE) && !(GetStyle() & WS_VISIBLE);
  HWND hWndSelf = m_hWnd;
  m_nFlags |= (WF_MODALLOOP | WF_CONTINUEMODAL);
  MSG msg;
  for (;;) {
    if (!ContinueModal()) break;
    while (bIdle && !::PeekMessageA(&msg, NULL, 0, 0, PM_NOREMOVE)) {
      if (bShowIdle) {
        ShowWindow(SW_SHOWNORMAL);
        UpdateWindow();
        bShowIdle = FALSE;
      }
      if (!(dwFlags & MLF_NOKICKIDLE) && !SendMessage(WM_KICKIDLE, MSGF_DIALOGBOX, lIdleCount++)) bIdle = FALSE;
      if (dwFlags & MLF_NOKICKIDLE) bIdle = FALSE;
    }
    do {
      if (!AfxPumpMessage()) {
        AfxPostQuitMessage(0); // keep WM_QUIT for the outer loop
        m_nFlags &= ~(WF_MODALLOOP | WF_CONTINUEMODAL);
        return -1;
      }
      if (!::IsWindow(hWndSelf)) return m_nModalResult; // destroyed meanwhile
      if (bShowIdle && !::PeekMessageA(&msg, NULL, 0, 0, PM_NOREMOVE)) {
        ShowWindow(SW_SHOWNORMAL);
        UpdateWindow();
        bShowIdle = FALSE;
      }
      if (!ContinueModal()) goto ExitModal;
      bIdle = TRUE;
      lIdleCount = 0;
    } while (::PeekMessageA(&msg, NULL, 0, 0, PM_NOREMOVE));
  }
ExitModal:
  m_nFlags &= ~(WF_MODALLOOP | WF_CONTINUEMODAL);
  return m_nModalResult;
}

// ---------------------------------------------------------------------------
// Default handlers: the window's own procedure
// ---------------------------------------------------------------------------

int CWnd::OnCreate(LPCREATESTRUCT) { return (int)Default(); }
void CWnd::OnDestroy() { Default(); }
void CWnd::OnClose() { Default(); }
void CWnd::OnPaint() { Default(); }
BOOL CWnd::OnEraseBkgnd(CDC*) { return (BOOL)Default(); }
void CWnd::OnSize(UINT, int, int) { Default(); }
void CWnd::OnMove(int, int) { Default(); }
void CWnd::OnTimer(UINT) { Default(); }
void CWnd::OnShowWindow(BOOL, UINT) { Default(); }
void CWnd::OnSetFocus(CWnd*) { Default(); }
void CWnd::OnKillFocus(CWnd*) { Default(); }
void CWnd::OnLButtonDown(UINT, CPoint) { Default(); }
void CWnd::OnLButtonUp(UINT, CPoint) { Default(); }
void CWnd::OnLButtonDblClk(UINT, CPoint) { Default(); }
void CWnd::OnRButtonDown(UINT, CPoint) { Default(); }
void CWnd::OnRButtonUp(UINT, CPoint) { Default(); }
void CWnd::OnMButtonDown(UINT, CPoint) { Default(); }
void CWnd::OnMouseMove(UINT, CPoint) { Default(); }
BOOL CWnd::OnMouseWheel(UINT, short, CPoint) { return (BOOL)Default(); }
void CWnd::OnContextMenu(CWnd*, CPoint) { Default(); }
void CWnd::OnKeyDown(UINT, UINT, UINT) { Default(); }
void CWnd::OnKeyUp(UINT, UINT, UINT) { Default(); }
void CWnd::OnChar(UINT, UINT, UINT) { Default(); }
void CWnd::OnSysKeyDown(UINT, UINT, UINT) { Default(); }
UINT CWnd::OnGetDlgCode() { return (UINT)Default(); }
BOOL CWnd::OnSetCursor(CWnd*, UINT, UINT) { return (BOOL)Default(); }
UINT CWnd::OnNcHitTest(CPoint) { return (UINT)Default(); }
void CWnd::OnHScroll(UINT, UINT, CScrollBar*) { Default(); }
void CWnd::OnVScroll(UINT, UINT, CScrollBar*) { Default(); }
void CWnd::OnDrawItem(int, LPDRAWITEMSTRUCT) { Default(); }
void CWnd::OnMeasureItem(int, LPMEASUREITEMSTRUCT) { Default(); }
HBRUSH CWnd::OnCtlColor(CDC*, CWnd*, UINT) { return (HBRUSH)Default(); }
void CWnd::OnActivate(UINT, CWnd*, BOOL) { Default(); }
void CWnd::OnActivateApp(BOOL, DWORD) { Default(); }
void CWnd::OnSysCommand(UINT, LPARAM) { Default(); }
void CWnd::OnGetMinMaxInfo(MINMAXINFO*) { Default(); }
void CWnd::OnWindowPosChanged(WINDOWPOS*) { Default(); }
void CWnd::OnDropFiles(HDROP) { Default(); }
BOOL CWnd::OnQueryEndSession() { return (BOOL)Default(); }
