// Per-thread and process-wide state of the window classes, the resource chain
// of extension modules, and message boxes.
#include "afxpriv.h"

#include <exception>

// ---------------------------------------------------------------------------
// Thread state
// ---------------------------------------------------------------------------

namespace {

CWnd* NewTempWnd(HWND h) {
  CWnd* p = new CWnd;
  p->m_hWnd = h;
  p->m_nFlags |= WF_TEMPORARY;
  return p;
}
void ClearTempWnd(CWnd* p) { p->m_hWnd = NULL; }

CDC* NewTempDC(HDC h) {
  CDC* p = new CDC;
  p->m_hDC = p->m_hAttribDC = h;
  return p;
}
void ClearTempDC(CDC* p) { p->m_hDC = p->m_hAttribDC = NULL; }

CGdiObject* NewTempGdi(HGDIOBJ h) {
  CGdiObject* p = new CGdiObject;
  p->m_hObject = h;
  return p;
}
void ClearTempGdi(CGdiObject* p) { p->m_hObject = NULL; }

CMenu* NewTempMenu(HMENU h) {
  CMenu* p = new CMenu;
  p->m_hMenu = h;
  return p;
}
void ClearTempMenu(CMenu* p) { p->m_hMenu = NULL; }

thread_local AFX_THREAD_STATE* t_pThreadState = NULL;

AFX_MODULE_STATE g_moduleState = {NULL, NULL, NULL, NULL, NULL, SRWLOCK_INIT};

} // namespace

AFX_THREAD_STATE::AFX_THREAD_STATE()
    : m_wndMap(&NewTempWnd, &ClearTempWnd), m_dcMap(&NewTempDC, &ClearTempDC),
      m_gdiMap(&NewTempGdi, &ClearTempGdi), m_menuMap(&NewTempMenu, &ClearTempMenu), m_pCurrentThread(NULL),
      m_pWndInit(NULL), m_hHookCbt(NULL), m_hLockoutNotifyWindow(NULL) {
  memset(&m_lastSentMsg, 0, sizeof(m_lastSentMsg));
  m_szClassName[0] = '\0';
}

AFX_THREAD_STATE::~AFX_THREAD_STATE() {
  if (m_hHookCbt != NULL) ::UnhookWindowsHookEx(m_hHookCbt);
}

AFX_THREAD_STATE* AfxGetThreadState() {
  if (t_pThreadState == NULL) t_pThreadState = new AFX_THREAD_STATE;
  return t_pThreadState;
}

void AfxTermThreadState() {
  delete t_pThreadState;
  t_pThreadState = NULL;
}

void AFXAPI AfxDeleteTempMaps() {
  AFX_THREAD_STATE* pState = AfxGetThreadState();
  pState->m_wndMap.DeleteTemp();
  pState->m_dcMap.DeleteTemp();
  pState->m_gdiMap.DeleteTemp();
  pState->m_menuMap.DeleteTemp();
}

AFX_MODULE_STATE* AfxGetModuleState() { return &g_moduleState; }

// ---------------------------------------------------------------------------
// Application, instance and resource handles
// ---------------------------------------------------------------------------

CWinApp* AFXAPI AfxGetApp() { return g_moduleState.m_pCurrentWinApp; }

CWnd* AFXAPI AfxGetMainWnd() {
  CWinThread* pThread = AfxGetThread();
  return pThread != NULL ? pThread->GetMainWnd() : NULL;
}

HINSTANCE AFXAPI AfxGetInstanceHandle() {
  if (g_moduleState.m_hCurrentInstanceHandle == NULL) return ::GetModuleHandle(NULL);
  return g_moduleState.m_hCurrentInstanceHandle;
}

HINSTANCE AFXAPI AfxGetResourceHandle() {
  if (g_moduleState.m_hCurrentResourceHandle == NULL) return AfxGetInstanceHandle();
  return g_moduleState.m_hCurrentResourceHandle;
}

void AFXAPI AfxSetResourceHandle(HINSTANCE hInstResource) {
  ASSERT(hInstResource != NULL);
  g_moduleState.m_hCurrentResourceHandle = hInstResource;
}

LPCTSTR AFXAPI AfxGetAppName() {
  if (g_moduleState.m_lpszCurrentAppName != NULL) return g_moduleState.m_lpszCurrentAppName;
  CWinApp* pApp = AfxGetApp();
  if (pApp != NULL && pApp->m_pszAppName != NULL) return pApp->m_pszAppName;
  return "";
}

namespace {

// The module holding the resource: the application's resource module first,
// then the extension modules (non-system ones before the system ones).
template <class Pred>
HINSTANCE SearchChain(Pred has) {
  HINSTANCE hInst = AfxGetResourceHandle();
  if (has(hInst)) return hInst;
  AcquireSRWLockShared(&g_moduleState.m_lock);
  HINSTANCE hFound = NULL;
  for (int pass = 0; pass < 2 && hFound == NULL; ++pass) {
    for (CDynLinkLibrary* pDLL = g_moduleState.m_pFirstDLL; pDLL != NULL; pDLL = pDLL->m_pNextDLL) {
      if ((pDLL->m_bSystem != FALSE) != (pass == 1) || pDLL->m_hResource == NULL) continue;
      if (has(pDLL->m_hResource)) {
        hFound = pDLL->m_hResource;
        break;
      }
    }
  }
  ReleaseSRWLockShared(&g_moduleState.m_lock);
  if (hFound != NULL) return hFound;
  // Last, MFC's own resources (its prompts) in this DLL.
  HMODULE hSelf = NULL;
  ::GetModuleHandleExA(GET_MODULE_HANDLE_EX_FLAG_FROM_ADDRESS | GET_MODULE_HANDLE_EX_FLAG_UNCHANGED_REFCOUNT,
                       (LPCSTR)&AfxFindResourceHandle, &hSelf);
  if (hSelf != NULL && has(hSelf)) return hSelf;
  return NULL;
}

// TRUE if the string table of hInst has a non-empty string nID.
BOOL HasString(HINSTANCE hInst, UINT nID) {
  HRSRC hRes = ::FindResourceA(hInst, MAKEINTRESOURCE((nID >> 4) + 1), (LPCSTR)RT_STRING);
  if (hRes == NULL) return FALSE;
  HGLOBAL hGlobal = ::LoadResource(hInst, hRes);
  if (hGlobal == NULL) return FALSE;
  const WORD* p = (const WORD*)::LockResource(hGlobal);
  DWORD cbSize = ::SizeofResource(hInst, hRes);
  const WORD* pEnd = (const WORD*)((const BYTE*)p + cbSize);
  if (p == NULL) return FALSE;
  for (UINT i = 0; i < (nID & 15); ++i) {
    if (p >= pEnd) return FALSE;
    p += 1 + *p;
  }
  return p < pEnd && *p != 0;
}

} // namespace

HINSTANCE AFXAPI AfxFindResourceHandle(LPCTSTR lpszName, LPCTSTR lpszType) {
  ASSERT(lpszName != NULL && lpszType != NULL);
  HINSTANCE hInst =
      SearchChain([&](HINSTANCE h) { return ::FindResourceA(h, lpszName, lpszType) != NULL; });
  return hInst != NULL ? hInst : AfxGetResourceHandle();
}

HINSTANCE AFXAPI AfxFindStringResourceHandle(UINT nID) {
  return SearchChain([&](HINSTANCE h) { return HasString(h, nID); });
}

// ---------------------------------------------------------------------------
// Extension modules
// ---------------------------------------------------------------------------

BOOL AFXAPI AfxInitExtensionModule(AFX_EXTENSION_MODULE& state, HMODULE hModule) {
  if (hModule == NULL) return FALSE;
  if (state.bInitialized) return TRUE;
  state.bInitialized = TRUE;
  state.hModule = hModule;
  state.hResource = hModule;
  // Run-time classes of the module register themselves for CRuntimeClass::FromName
  // as the module's static objects are constructed; nothing to move here.
  state.pFirstSharedClass = NULL;
  state.pFirstSharedFactory = NULL;
  return TRUE;
}

void AFXAPI AfxTermExtensionModule(AFX_EXTENSION_MODULE& state, BOOL bAll) {
  if (!state.bInitialized) return;
  for (;;) {
    CDynLinkLibrary* pVictim = NULL;
    AcquireSRWLockShared(&g_moduleState.m_lock);
    for (CDynLinkLibrary* p = g_moduleState.m_pFirstDLL; p != NULL; p = p->m_pNextDLL) {
      if (bAll || p->m_hModule == state.hModule) {
        pVictim = p;
        break;
      }
    }
    ReleaseSRWLockShared(&g_moduleState.m_lock);
    if (pVictim == NULL) break;
    delete pVictim; // unlinks itself
  }
  state.bInitialized = FALSE;
}

IMPLEMENT_DYNAMIC(CDynLinkLibrary, CCmdTarget)

CDynLinkLibrary::CDynLinkLibrary(AFX_EXTENSION_MODULE& state, BOOL bSystem)
    : m_hModule(state.hModule), m_hResource(state.hResource), m_bSystem(bSystem), m_pNextDLL(NULL) {
  ASSERT(state.bInitialized);
  AddToChain();
}

CDynLinkLibrary::CDynLinkLibrary(HINSTANCE hModule, HINSTANCE hResource)
    : m_hModule(hModule), m_hResource(hResource), m_bSystem(FALSE), m_pNextDLL(NULL) {
  AddToChain();
}

void CDynLinkLibrary::AddToChain() {
  AcquireSRWLockExclusive(&g_moduleState.m_lock);
  m_pNextDLL = g_moduleState.m_pFirstDLL;
  g_moduleState.m_pFirstDLL = this;
  ReleaseSRWLockExclusive(&g_moduleState.m_lock);
}

CDynLinkLibrary::~CDynLinkLibrary() {
  AcquireSRWLockExclusive(&g_moduleState.m_lock);
  for (CDynLinkLibrary** pp = &g_moduleState.m_pFirstDLL; *pp != NULL; pp = &(*pp)->m_pNextDLL) {
    if (*pp == this) {
      *pp = m_pNextDLL;
      break;
    }
  }
  ReleaseSRWLockExclusive(&g_moduleState.m_lock);
}

// ---------------------------------------------------------------------------
// Message boxes and error reports
// ---------------------------------------------------------------------------

int AFXAPI AfxMessageBox(LPCTSTR lpszText, UINT nType, UINT nIDHelp) {
  CWinApp* pApp = AfxGetApp();
  if (pApp != NULL) return pApp->DoMessageBox(lpszText, nType, nIDHelp);
  // No application object: a plain box owned by the active window.
  HWND hOwner = ::GetActiveWindow();
  return ::MessageBoxA(hOwner, lpszText, AfxGetAppName(), nType);
}

int AFXAPI AfxMessageBox(UINT nIDPrompt, UINT nType, UINT nIDHelp) {
  CString strPrompt;
  if (!strPrompt.LoadString(nIDPrompt)) strPrompt.Format("Meldung %u (Text nicht gefunden)", nIDPrompt);
  if (nIDHelp == (UINT)-1) nIDHelp = nIDPrompt;
  CWinApp* pApp = AfxGetApp();
  if (pApp != NULL) return pApp->DoMessageBox(strPrompt, nType, nIDHelp);
  return ::MessageBoxA(::GetActiveWindow(), strPrompt, AfxGetAppName(), nType);
}

int CException::ReportError(UINT nType, UINT nMessageID) {
  char szErrorMessage[512];
  UINT nHelpContext = 0;
  if (GetErrorMessage(szErrorMessage, sizeof(szErrorMessage), &nHelpContext))
    return AfxMessageBox(szErrorMessage, nType, nHelpContext);
  if (nMessageID != 0 && AfxFindStringResourceHandle(nMessageID) != NULL)
    return AfxMessageBox(nMessageID, nType, nHelpContext);
  CString strGeneric;
  if (!strGeneric.LoadString(AFX_IDP_NO_ERROR_AVAILABLE)) strGeneric = "Es ist ein Fehler aufgetreten.";
  return AfxMessageBox(strGeneric, nType, nHelpContext);
}

LRESULT AfxProcessWndProcException(CException* e, const MSG* pMsg) {
  CWinThread* pThread = AfxGetThread();
  if (pThread != NULL) return pThread->ProcessWndProcException(e, pMsg);
  if (!e->IsKindOf(RUNTIME_CLASS(CUserException))) e->ReportError(MB_ICONSTOP, AFX_IDP_INTERNAL_FAILURE);
  return pMsg != NULL && pMsg->message == WM_CREATE ? -1 : 0;
}

void AfxReportForeignException(const char* lpszWhat) {
  CString strText;
  AfxFormatString1(strText, AFX_IDP_UNHANDLED_EXCEPTION, lpszWhat != NULL ? lpszWhat : "");
  if (strText.IsEmpty()) strText.Format("Ein unerwarteter Fehler ist aufgetreten: %s", lpszWhat);
  AfxMessageBox(strText, MB_ICONSTOP);
}

// ---------------------------------------------------------------------------
// Window classes
// ---------------------------------------------------------------------------

LPCTSTR AFXAPI AfxRegisterWndClass(UINT nClassStyle, HCURSOR hCursor, HBRUSH hbrBackground, HICON hIcon) {
  AFX_THREAD_STATE* pState = AfxGetThreadState();
  HINSTANCE hInst = AfxGetInstanceHandle();
  LPSTR lpszName = pState->m_szClassName;
  snprintf(lpszName, sizeof(pState->m_szClassName), "Afx:%p:%x:%p:%p:%p", (void*)hInst, nClassStyle,
           (void*)hCursor, (void*)hbrBackground, (void*)hIcon);
  WNDCLASSA wc;
  if (::GetClassInfoA(hInst, lpszName, &wc)) return lpszName;
  memset(&wc, 0, sizeof(wc));
  wc.style = nClassStyle;
  wc.lpfnWndProc = ::DefWindowProcA; // CWnd objects subclass with AfxWndProc
  wc.hInstance = hInst;
  wc.hIcon = hIcon;
  wc.hCursor = hCursor;
  wc.hbrBackground = hbrBackground;
  wc.lpszClassName = lpszName;
  if (!::RegisterClassA(&wc)) AfxThrowResourceException();
  return lpszName;
}
