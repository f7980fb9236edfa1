// CDialog: modal dialogs run as modeless dialogs in our own modal loop (so that
// PreTranslateMessage and message maps see every message), and modeless dialogs.
#include "afxpriv.h"
#include "win_private.h"

#include <exception>

IMPLEMENT_DYNAMIC(CDialog, CWnd)

BEGIN_MESSAGE_MAP(CDialog, CWnd)
  ON_COMMAND(IDOK, OnOK)
  ON_COMMAND(IDCANCEL, OnCancel)
END_MESSAGE_MAP()

// The dialog procedure: everything but WM_INITDIALOG reaches the CDialog through
// AfxWndProc, which subclasses the dialog window.
INT_PTR CALLBACK AfxDlgProc(HWND hWnd, UINT message, WPARAM wParam, LPARAM lParam) {
  (void)wParam;
  (void)lParam;
  if (message != WM_INITDIALOG) return FALSE;
  CDialog* pDlg = DYNAMIC_DOWNCAST(CDialog, CWnd::FromHandlePermanent(hWnd));
  if (pDlg == NULL) return TRUE;
  RECT rcBefore;
  ::GetWindowRect(hWnd, &rcBefore);
  BOOL bResult = TRUE;
  try {
    bResult = pDlg->OnInitDialog();
  } catch (CException* e) {
    MSG msg = {hWnd, message, wParam, lParam, 0, {0, 0}};
    AfxProcessWndProcException(e, &msg);
    e->Delete();
  } catch (std::exception& e) {
    AfxReportForeignException(e.what());
  } catch (...) {
    AfxReportForeignException("unbekannte Ausnahme");
  }
  // A top-level dialog that did not place itself is centred on its owner.
  if (::IsWindow(hWnd)) {
    DWORD dwStyle = (DWORD)::GetWindowLongA(hWnd, GWL_STYLE);
    RECT rcAfter;
    ::GetWindowRect(hWnd, &rcAfter);
    if (!(dwStyle & (WS_CHILD | DS_ABSALIGN | DS_CENTER)) && rcBefore.left == rcAfter.left &&
        rcBefore.top == rcAfter.top && CWnd::FromHandlePermanent(hWnd) == pDlg)
      pDlg->CenterWindow();
  }
  return bResult;
}

void CDialog::CommonConstruct() {
  m_lpszTemplateName = NULL;
  m_hDialogTemplate = NULL;
  m_lpDialogTemplate = NULL;
  m_lpDialogInit = NULL;
  m_pParentWnd = NULL;
  m_hWndTop = NULL;
  m_nIDHelp = 0;
}

CDialog::CDialog() { CommonConstruct(); }

CDialog::CDialog(LPCTSTR lpszTemplateName, CWnd* pParentWnd) {
  CommonConstruct();
  m_lpszTemplateName = lpszTemplateName;
  m_pParentWnd = pParentWnd;
  if (IS_INTRESOURCE(lpszTemplateName)) m_nIDHelp = (UINT)(UINT_PTR)lpszTemplateName;
}

CDialog::CDialog(UINT nIDTemplate, CWnd* pParentWnd) {
  CommonConstruct();
  m_lpszTemplateName = MAKEINTRESOURCE(nIDTemplate);
  m_pParentWnd = pParentWnd;
  m_nIDHelp = nIDTemplate;
}

CDialog::~CDialog() {
  if (m_hWnd != NULL && FromHandlePermanent(m_hWnd) == this) DestroyWindow();
}

BOOL CDialog::CreateDlgIndirect(LPCDLGTEMPLATE lpDialogTemplate, CWnd* pParentWnd, HINSTANCE hInst) {
  ASSERT(lpDialogTemplate != NULL);
  if (hInst == NULL) hInst = AfxGetResourceHandle();
  m_nModalResult = -1;
  qownd::ComCtl();  // the control classes, before the first dialog
  AfxHookWindowCreate(this);
  HWND hWnd = ::CreateDialogIndirectParamA(hInst, lpDialogTemplate, pParentWnd->GetSafeHwnd(), &AfxDlgProc, 0);
  if (!AfxUnhookWindowCreate()) {
    // Never attached: the template could not be made into a window.
    return FALSE;
  }
  if (hWnd == NULL) {
    // Attached but destroyed during creation (a failing control, ...).
    if (m_hWnd != NULL) Detach();
    return FALSE;
  }
  return ::IsWindow(hWnd) && m_hWnd == hWnd;
}

static LPCDLGTEMPLATE LoadTemplate(LPCTSTR lpszTemplateName, HINSTANCE& hInst) {
  hInst = AfxFindResourceHandle(lpszTemplateName, (LPCSTR)RT_DIALOG);
  HRSRC hResource = ::FindResourceA(hInst, lpszTemplateName, (LPCSTR)RT_DIALOG);
  if (hResource == NULL) return NULL;
  HGLOBAL hTemplate = ::LoadResource(hInst, hResource);
  if (hTemplate == NULL) return NULL;
  return (LPCDLGTEMPLATE)::LockResource(hTemplate);
}

BOOL CDialog::Create(LPCTSTR lpszTemplateName, CWnd* pParentWnd) {
  ASSERT(lpszTemplateName != NULL);
  m_lpszTemplateName = lpszTemplateName;
  if (IS_INTRESOURCE(lpszTemplateName) && m_nIDHelp == 0) m_nIDHelp = (UINT)(UINT_PTR)lpszTemplateName;
  HINSTANCE hInst = NULL;
  LPCDLGTEMPLATE lpTemplate = LoadTemplate(lpszTemplateName, hInst);
  if (lpTemplate == NULL) return FALSE;
  if (pParentWnd == NULL) pParentWnd = AfxGetMainWnd();
  m_pParentWnd = pParentWnd;
  return CreateDlgIndirect(lpTemplate, pParentWnd, hInst);
}

BOOL CDialog::Create(UINT nIDTemplate, CWnd* pParentWnd) { return Create(MAKEINTRESOURCE(nIDTemplate), pParentWnd); }

BOOL CDialog::CreateIndirect(LPCDLGTEMPLATE lpDialogTemplate, CWnd* pParentWnd, void* lpDialogInit) {
  m_lpDialogInit = lpDialogInit;
  if (pParentWnd == NULL) pParentWnd = AfxGetMainWnd();
  m_pParentWnd = pParentWnd;
  return CreateDlgIndirect(lpDialogTemplate, pParentWnd, NULL);
}

BOOL CDialog::CreateIndirect(HGLOBAL hDialogTemplate, CWnd* pParentWnd) {
  ASSERT(hDialogTemplate != NULL);
  LPCDLGTEMPLATE lpTemplate = (LPCDLGTEMPLATE)::GlobalLock(hDialogTemplate);
  BOOL bResult = CreateIndirect(lpTemplate, pParentWnd, NULL);
  ::GlobalUnlock(hDialogTemplate);
  return bResult;
}

BOOL CDialog::InitModalIndirect(LPCDLGTEMPLATE lpDialogTemplate, CWnd* pParentWnd, void* lpDialogInit) {
  ASSERT(lpDialogTemplate != NULL);
  m_lpDialogTemplate = lpDialogTemplate;
  m_pParentWnd = pParentWnd;
  m_lpDialogInit = lpDialogInit;
  return TRUE;
}

HWND CDialog::PreModal() {
  // The owner: the parent given, else the main window or the active window,
  // always a top-level window.
  HWND hWnd = m_pParentWnd->GetSafeHwnd();
  if (hWnd == NULL) {
    CWnd* pMain = AfxGetMainWnd();
    hWnd = pMain != NULL && ::IsWindow(pMain->m_hWnd) ? pMain->m_hWnd : ::GetActiveWindow();
  }
  if (hWnd != NULL) {
    HWND hTop = ::GetAncestor(hWnd, GA_ROOT);
    if (hTop != NULL) hWnd = ::GetLastActivePopup(hTop);
  }
  m_hWndTop = NULL;
  return hWnd;
}

void CDialog::PostModal() { m_hWndTop = NULL; }

INT_PTR CDialog::DoModal() {
  LPCDLGTEMPLATE lpDialogTemplate = m_lpDialogTemplate;
  HINSTANCE hInst = AfxGetResourceHandle();
  if (m_lpszTemplateName != NULL) {
    lpDialogTemplate = LoadTemplate(m_lpszTemplateName, hInst);
  } else if (m_hDialogTemplate != NULL) {
    lpDialogTemplate = (LPCDLGTEMPLATE)::GlobalLock(m_hDialogTemplate);
  }
  if (lpDialogTemplate == NULL) return -1;

  HWND hWndParent = PreModal();
  BOOL bEnableParent = FALSE;
  if (hWndParent != NULL && hWndParent != ::GetDesktopWindow() && ::IsWindowEnabled(hWndParent)) {
    ::EnableWindow(hWndParent, FALSE);
    bEnableParent = TRUE;
  }

  m_nModalResult = -1;
  m_nFlags |= WF_CONTINUEMODAL;
  if (CreateDlgIndirect(lpDialogTemplate, CWnd::FromHandle(hWndParent), hInst)) {
    // EndDialog in OnInitDialog ends the dialog before its loop starts.
    if (m_nFlags & WF_CONTINUEMODAL) {
      DWORD dwFlags = MLF_SHOWONIDLE;
      if (GetStyle() & DS_NOIDLEMSG) dwFlags |= MLF_NOIDLEMSG;
      RunModalLoop(dwFlags);
    }
    if (m_hWnd != NULL)
      ::SetWindowPos(m_hWnd, NULL, 0, 0, 0, 0,
                     SWP_HIDEWINDOW | SWP_NOSIZE | SWP_NOMOVE | SWP_NOACTIVATE | SWP_NOZORDER);
  }
  m_nFlags &= ~(WF_CONTINUEMODAL | WF_MODALLOOP);

  if (bEnableParent) ::EnableWindow(hWndParent, TRUE);
  if (hWndParent != NULL && m_hWnd != NULL && ::GetActiveWindow() == m_hWnd) ::SetActiveWindow(hWndParent);

  // Destroy the window; the object stays for the caller to read its members.
  if (m_hWnd != NULL) DestroyWindow();
  PostModal();
  if (m_lpszTemplateName == NULL && m_hDialogTemplate != NULL) ::GlobalUnlock(m_hDialogTemplate);
  return m_nModalResult;
}

void CDialog::EndDialog(int nResult) {
  ASSERT(::IsWindow(m_hWnd));
  if (m_nFlags & (WF_MODALLOOP | WF_CONTINUEMODAL))
    EndModalLoop(nResult);
  else
    ::EndDialog(m_hWnd, nResult); // modeless: hidden, not destroyed
}

BOOL CDialog::OnInitDialog() {
  // Fills the controls from the members; a failure is not fatal here.
  UpdateData(FALSE);
  return TRUE; // the system sets the focus to the first control
}

void CDialog::OnSetFont(CFont* pFont) { (void)pFont; }

void CDialog::OnOK() {
  if (!UpdateData(TRUE)) return; // the focus is on the bad control
  EndDialog(IDOK);
}

void CDialog::OnCancel() { EndDialog(IDCANCEL); }

BOOL CDialog::PreTranslateInput(LPMSG lpMsg) {
  ASSERT(::IsWindow(m_hWnd));
  if ((lpMsg->message < WM_KEYFIRST || lpMsg->message > WM_KEYLAST) &&
      (lpMsg->message < WM_MOUSEFIRST || lpMsg->message > WM_MOUSELAST))
    return FALSE;
  return ::IsDialogMessageA(m_hWnd, lpMsg);
}

BOOL CDialog::PreTranslateMessage(MSG* pMsg) {
  if (m_hWnd == NULL || !::IsWindow(m_hWnd)) return FALSE;
  // Only messages of this dialog and its controls.
  if (pMsg->hwnd != m_hWnd && !::IsChild(m_hWnd, pMsg->hwnd)) return FALSE;
  return PreTranslateInput(pMsg);
}

BOOL CDialog::OnCmdMsg(UINT nID, int nCode, void* pExtra, AFX_CMDHANDLERINFO* pHandlerInfo) {
  return CWnd::OnCmdMsg(nID, nCode, pExtra, pHandlerInfo);
}

void CDialog::NextDlgCtrl() const { ::SendMessageA(m_hWnd, WM_NEXTDLGCTL, 0, 0); }
void CDialog::PrevDlgCtrl() const { ::SendMessageA(m_hWnd, WM_NEXTDLGCTL, 1, 0); }
void CDialog::GotoDlgCtrl(CWnd* pWndCtrl) {
  if (pWndCtrl != NULL && pWndCtrl->m_hWnd != NULL)
    ::SendMessageA(m_hWnd, WM_NEXTDLGCTL, (WPARAM)pWndCtrl->m_hWnd, 1L);
}
void CDialog::SetDefID(UINT nID) { ::SendMessageA(m_hWnd, DM_SETDEFID, nID, 0); }
DWORD CDialog::GetDefID() const { return (DWORD)::SendMessageA(m_hWnd, DM_GETDEFID, 0, 0); }
void CDialog::MapDialogRect(LPRECT lpRect) const { ::MapDialogRect(m_hWnd, lpRect); }
