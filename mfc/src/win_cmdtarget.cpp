// Command routing through message maps, and the command user-interface state.
#include "afxpriv.h"

IMPLEMENT_DYNAMIC(CCmdTarget, CObject)

CCmdTarget::CCmdTarget() {}
CCmdTarget::~CCmdTarget() {}

const AFX_MSGMAP* PASCAL CCmdTarget::GetThisMessageMap() {
  static const AFX_MSGMAP_ENTRY _messageEntries[] = {{0, 0, 0, 0, AfxSig_end, (AFX_PMSG)0}};
  static const AFX_MSGMAP messageMap = {NULL, &_messageEntries[0]};
  return &messageMap;
}

const AFX_MSGMAP* CCmdTarget::GetMessageMap() const { return GetThisMessageMap(); }

const AFX_MSGMAP_ENTRY* AFXAPI AfxFindMessageEntry(const AFX_MSGMAP_ENTRY* lpEntry, UINT nMsg, UINT nCode,
                                                   UINT nID) {
  for (; lpEntry->nSig != AfxSig_end; ++lpEntry) {
    if (lpEntry->nMessage == nMsg && lpEntry->nCode == nCode && nID >= lpEntry->nID && nID <= lpEntry->nLastID)
      return lpEntry;
  }
  return NULL;
}

const AFX_MSGMAP_ENTRY* AfxFindWindowMessage(const AFX_MSGMAP* pMap, UINT nMsg) {
  for (; pMap != NULL; pMap = pMap->pfnGetBaseMap != NULL ? pMap->pfnGetBaseMap() : NULL) {
    if (nMsg >= 0xC000 && nMsg <= 0xFFFF) {
      // Registered messages: the entry holds the address of the variable with the number.
      for (const AFX_MSGMAP_ENTRY* p = pMap->lpEntries; p->nSig != AfxSig_end; ++p) {
        if (p->nMessage == 0xC000 && *(const UINT*)p->nSig == nMsg) return p;
      }
      continue;
    }
    if (const AFX_MSGMAP_ENTRY* p = AfxFindMessageEntry(pMap->lpEntries, nMsg, 0, 0)) return p;
  }
  return NULL;
}

static BOOL DispatchCmdMsg(CCmdTarget* pTarget, UINT nID, int nCode, AFX_PMSG pfn, void* pExtra, UINT_PTR nSig) {
  MessageMapFunctions mmf;
  mmf.pfn = pfn;
  BOOL bResult = TRUE;
  switch (nSig) {
  case AfxSigCmd_v:
    (pTarget->*mmf.pfnCmd_v_v)();
    break;
  case AfxSigCmd_b:
    bResult = (pTarget->*mmf.pfnCmd_b_v)();
    break;
  case AfxSigCmd_RANGE:
    (pTarget->*mmf.pfnCmd_v_u)(nID);
    break;
  case AfxSigCmd_EX:
    bResult = (pTarget->*mmf.pfnCmd_b_u)(nID);
    break;
  case AfxSigCmdUI: {
    CCmdUI* pCmdUI = (CCmdUI*)pExtra;
    ASSERT(pCmdUI != NULL);
    pCmdUI->m_bContinueRouting = FALSE;
    (pTarget->*mmf.pfnCmdUI)(pCmdUI);
    bResult = !pCmdUI->m_bContinueRouting;
    pCmdUI->m_bContinueRouting = FALSE;
    break;
  }
  case AfxSigNotify_v: {
    AFX_NOTIFY* pNotify = (AFX_NOTIFY*)pExtra;
    ASSERT(pNotify != NULL);
    (pTarget->*mmf.pfnNotify_v)(pNotify->pNMHDR, pNotify->pResult);
    break;
  }
  case AfxSigNotify_b: {
    AFX_NOTIFY* pNotify = (AFX_NOTIFY*)pExtra;
    ASSERT(pNotify != NULL);
    bResult = (pTarget->*mmf.pfnNotify_b)(pNotify->pNMHDR, pNotify->pResult);
    break;
  }
  case AfxSigNotify_RANGE: {
    AFX_NOTIFY* pNotify = (AFX_NOTIFY*)pExtra;
    ASSERT(pNotify != NULL);
    (pTarget->*mmf.pfnNotify_RANGE)(nID, pNotify->pNMHDR, pNotify->pResult);
    break;
  }
  case AfxSigNotify_EX: {
    AFX_NOTIFY* pNotify = (AFX_NOTIFY*)pExtra;
    ASSERT(pNotify != NULL);
    bResult = (pTarget->*mmf.pfnNotify_EX)(nID, pNotify->pNMHDR, pNotify->pResult);
    break;
  }
  default:
    ASSERT(FALSE); // a window-message entry filed under WM_COMMAND/WM_NOTIFY
    bResult = FALSE;
    break;
  }
  (void)nCode;
  return bResult;
}

BOOL CCmdTarget::OnCmdMsg(UINT nID, int nCode, void* pExtra, AFX_CMDHANDLERINFO* pHandlerInfo) {
  UINT nMsg = 0;
  UINT nCodeKey = (UINT)nCode;
  if ((UINT)nCode != CN_UPDATE_COMMAND_UI) {
    nMsg = HIWORD(nCode);
    nCodeKey = LOWORD(nCode);
  }
  if (nMsg == 0) nMsg = WM_COMMAND;

  for (const AFX_MSGMAP* pMap = GetMessageMap(); pMap != NULL;
       pMap = pMap->pfnGetBaseMap != NULL ? pMap->pfnGetBaseMap() : NULL) {
    const AFX_MSGMAP_ENTRY* lpEntry = AfxFindMessageEntry(pMap->lpEntries, nMsg, nCodeKey, nID);
    if (lpEntry == NULL) continue;
    if (pHandlerInfo != NULL) {
      pHandlerInfo->pTarget = this;
      pHandlerInfo->pmf = lpEntry->pfn;
      return TRUE;
    }
    return DispatchCmdMsg(this, nID, (int)nCodeKey, lpEntry->pfn, pExtra, lpEntry->nSig);
  }
  return FALSE;
}

void CCmdTarget::BeginWaitCursor() {
  if (CWinApp* pApp = AfxGetApp()) pApp->DoWaitCursor(1);
}
void CCmdTarget::EndWaitCursor() {
  if (CWinApp* pApp = AfxGetApp()) pApp->DoWaitCursor(-1);
}
void CCmdTarget::RestoreWaitCursor() {
  if (CWinApp* pApp = AfxGetApp()) pApp->DoWaitCursor(0);
}

// ---------------------------------------------------------------------------
// CCmdUI
// ---------------------------------------------------------------------------

CCmdUI::CCmdUI()
    : m_nID(0), m_nIndex(0), m_pMenu(NULL), m_pSubMenu(NULL), m_pOther(NULL), m_nIndexMax(0),
      m_bEnableChanged(FALSE), m_bContinueRouting(FALSE) {}

void CCmdUI::Enable(BOOL bOn) {
  if (m_pMenu != NULL) {
    if (m_pSubMenu != NULL) return; // popups are not enabled through their items
    m_pMenu->EnableMenuItem(m_nIndex, MF_BYPOSITION | (bOn ? MF_ENABLED : (MF_DISABLED | MF_GRAYED)));
  } else if (m_pOther != NULL) {
    // Move the focus away from a control that is about to be disabled.
    if (!bOn && ::GetFocus() == m_pOther->m_hWnd) {
      HWND hParent = ::GetParent(m_pOther->m_hWnd);
      if (hParent != NULL) ::SendMessageA(hParent, WM_NEXTDLGCTL, 0, FALSE);
    }
    m_pOther->EnableWindow(bOn);
  }
  m_bEnableChanged = TRUE;
}

void CCmdUI::SetCheck(int nCheck) {
  if (m_pMenu != NULL) {
    if (m_pSubMenu != NULL) return;
    m_pMenu->CheckMenuItem(m_nIndex, MF_BYPOSITION | (nCheck ? MF_CHECKED : MF_UNCHECKED));
  } else if (m_pOther != NULL) {
    if (m_pOther->SendMessage(WM_GETDLGCODE) & DLGC_BUTTON) m_pOther->SendMessage(BM_SETCHECK, nCheck);
  }
}

void CCmdUI::SetRadio(BOOL bOn) { SetCheck(bOn ? 1 : 0); }

void CCmdUI::SetText(LPCTSTR lpszText) {
  ASSERT(lpszText != NULL);
  if (m_pMenu != NULL) {
    if (m_pSubMenu != NULL) return;
    UINT nState = m_pMenu->GetMenuState(m_nIndex, MF_BYPOSITION) & (MF_GRAYED | MF_DISABLED | MF_CHECKED);
    m_pMenu->ModifyMenu(m_nIndex, MF_BYPOSITION | MF_STRING | nState, m_nID, lpszText);
  } else if (m_pOther != NULL) {
    AfxSetWindowText(m_pOther->m_hWnd, lpszText);
  }
}

BOOL CCmdUI::DoUpdate(CCmdTarget* pTarget, BOOL bDisableIfNoHndler) {
  if (m_nID == 0 || LOWORD(m_nID) == 0xFFFF) return TRUE; // separators and invalid ids
  m_bEnableChanged = FALSE;
  BOOL bResult = pTarget->OnCmdMsg(m_nID, (int)CN_UPDATE_COMMAND_UI, this, NULL);
  if (bDisableIfNoHndler && !m_bEnableChanged) {
    AFX_CMDHANDLERINFO info = {NULL, NULL};
    BOOL bHandler = pTarget->OnCmdMsg(m_nID, CN_COMMAND, this, &info);
    Enable(bHandler);
  }
  return bResult;
}
