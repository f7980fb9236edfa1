// CWinApp and the start and end of an MFC program.
#include "afxpriv.h"

#include <exception>
#include <stdlib.h>

IMPLEMENT_DYNAMIC(CWinApp, CWinThread)

BEGIN_MESSAGE_MAP(CWinApp, CWinThread)
END_MESSAGE_MAP()

CWinApp::CWinApp(LPCTSTR lpszAppName)
    : m_pszAppName(NULL), m_pszExeName(NULL), m_pszHelpFilePath(NULL), m_pszProfileName(NULL),
      m_pszRegistryKey(NULL), m_hInstance(NULL), m_hPrevInstance(NULL), m_lpCmdLine(NULL), m_nCmdShow(SW_SHOWNORMAL),
      m_nWaitCursorCount(0), m_hcurWaitCursorRestore(NULL) {
  if (lpszAppName != NULL) {
    m_strAppName = lpszAppName;
    m_pszAppName = m_strAppName;
  }
  AFX_MODULE_STATE* pModuleState = AfxGetModuleState();
  ASSERT(pModuleState->m_pCurrentWinApp == NULL); // one CWinApp object only
  pModuleState->m_pCurrentWinApp = this;
  // The application object is the thread object of the thread that constructs it.
  m_hThread = ::GetCurrentThread();
  m_nThreadID = ::GetCurrentThreadId();
  m_bAutoDelete = FALSE;
}

CWinApp::~CWinApp() {
  AFX_MODULE_STATE* pModuleState = AfxGetModuleState();
  if (pModuleState->m_pCurrentWinApp == this) {
    pModuleState->m_pCurrentWinApp = NULL;
    pModuleState->m_lpszCurrentAppName = NULL;
  }
  m_hThread = NULL; // a pseudo handle, not closed
}

void CWinApp::SetCurrentHandles() {
  AFX_MODULE_STATE* pModuleState = AfxGetModuleState();
  pModuleState->m_hCurrentInstanceHandle = m_hInstance;
  if (pModuleState->m_hCurrentResourceHandle == NULL) pModuleState->m_hCurrentResourceHandle = m_hInstance;

  char szPath[MAX_PATH];
  DWORD n = ::GetModuleFileNameA(m_hInstance, szPath, MAX_PATH);
  szPath[n < MAX_PATH ? n : MAX_PATH - 1] = '\0';
  const char* pszName = strrchr(szPath, '\\');
  pszName = pszName != NULL ? pszName + 1 : szPath;
  CString strExe(pszName);
  int nDot = strExe.ReverseFind('.');
  if (nDot > 0) strExe = strExe.Left(nDot);
  if (m_pszExeName == NULL) {
    m_strExeName = strExe;
    m_pszExeName = m_strExeName;
  }
  if (m_pszAppName == NULL) {
    // The application's title string if it has one, else the executable's name.
    CString strTitle;
    if (AfxFindStringResourceHandle(AFX_IDS_APP_TITLE) != NULL && strTitle.LoadString(AFX_IDS_APP_TITLE))
      m_strAppName = strTitle;
    else
      m_strAppName = m_pszExeName;
    m_pszAppName = m_strAppName;
  }
  pModuleState->m_lpszCurrentAppName = m_pszAppName;
}

BOOL CWinApp::InitApplication() { return TRUE; }
BOOL CWinApp::InitInstance() { return TRUE; }

int CWinApp::ExitInstance() { return (int)m_msgCur.wParam; }

int CWinApp::Run() {
  // Without a main window nothing would ever end the loop.
  if (m_pMainWnd == NULL) AfxPostQuitMessage(0);
  return CWinThread::Run();
}

BOOL CWinApp::OnIdle(LONG lCount) { return CWinThread::OnIdle(lCount); }

int CWinApp::DoMessageBox(LPCTSTR lpszPrompt, UINT nType, UINT nIDPrompt) {
  (void)nIDPrompt;
  // Owner: the last active popup of the main window (or of the thread's active window).
  HWND hOwner = NULL;
  CWnd* pMainWnd = AfxGetMainWnd();
  if (pMainWnd != NULL && ::IsWindow(pMainWnd->m_hWnd))
    hOwner = pMainWnd->m_hWnd;
  else
    hOwner = ::GetActiveWindow();
  if (hOwner != NULL) {
    HWND hTop = ::GetAncestor(hOwner, GA_ROOT);
    if (hTop != NULL) hOwner = hTop;
    hOwner = ::GetLastActivePopup(hOwner);
  }
  // Message boxes without an icon get MFC's default one.
  if ((nType & MB_ICONMASK) == 0) {
    switch (nType & MB_TYPEMASK) {
    case MB_OK:
    case MB_OKCANCEL:
      nType |= MB_ICONEXCLAMATION;
      break;
    case MB_YESNO:
    case MB_YESNOCANCEL:
      nType |= MB_ICONQUESTION;
      break;
    case MB_ABORTRETRYIGNORE:
    case MB_RETRYCANCEL:
      break;
    }
  }
  LPCTSTR lpszCaption = m_pszAppName != NULL ? m_pszAppName : "";
  // Keep a wait cursor from showing over the box.
  int nWait = m_nWaitCursorCount;
  if (nWait > 0) ::SetCursor(::LoadCursorA(NULL, IDC_ARROW));
  int nResult = ::MessageBoxA(hOwner, lpszPrompt, lpszCaption, nType);
  if (nWait > 0) DoWaitCursor(0);
  return nResult;
}

void CWinApp::DoWaitCursor(int nCode) {
  ASSERT(nCode == 0 || nCode == 1 || nCode == -1);
  m_nWaitCursorCount += nCode;
  if (m_nWaitCursorCount > 0) {
    HCURSOR hcurPrev = ::SetCursor(::LoadCursorA(NULL, IDC_WAIT));
    if (nCode > 0 && m_nWaitCursorCount == 1) m_hcurWaitCursorRestore = hcurPrev;
  } else {
    m_nWaitCursorCount = 0; // unbalanced EndWaitCursor does not go negative
    ::SetCursor(m_hcurWaitCursorRestore != NULL ? m_hcurWaitCursorRestore : ::LoadCursorA(NULL, IDC_ARROW));
  }
}

HICON CWinApp::LoadIcon(LPCTSTR lpszResourceName) const {
  return ::LoadIconA(AfxFindResourceHandle(lpszResourceName, (LPCSTR)RT_GROUP_ICON), lpszResourceName);
}
HICON CWinApp::LoadIcon(UINT nIDResource) const { return LoadIcon(MAKEINTRESOURCE(nIDResource)); }
HICON CWinApp::LoadStandardIcon(LPCTSTR lpszIconName) const { return ::LoadIconA(NULL, lpszIconName); }
HCURSOR CWinApp::LoadCursor(LPCTSTR lpszResourceName) const {
  return ::LoadCursorA(AfxFindResourceHandle(lpszResourceName, (LPCSTR)RT_GROUP_CURSOR), lpszResourceName);
}
HCURSOR CWinApp::LoadCursor(UINT nIDResource) const { return LoadCursor(MAKEINTRESOURCE(nIDResource)); }
HCURSOR CWinApp::LoadStandardCursor(LPCTSTR lpszCursorName) const { return ::LoadCursorA(NULL, lpszCursorName); }

void CWinApp::ParseCommandLine() {
  m_strCmdFile.Empty();
  m_astrSwitches.RemoveAll();
  for (int i = 1; i < __argc; ++i) {
    const char* pszArg = __argv[i];
    if (pszArg == NULL) continue;
    if (pszArg[0] == '/' || pszArg[0] == '-')
      m_astrSwitches.Add(CString(pszArg + 1));
    else if (m_strCmdFile.IsEmpty())
      m_strCmdFile = pszArg;
  }
}

// ---------------------------------------------------------------------------
// Start and end
// ---------------------------------------------------------------------------

BOOL AFXAPI AfxWinInit(HINSTANCE hInstance, HINSTANCE hPrevInstance, LPTSTR lpCmdLine, int nCmdShow) {
  AFX_MODULE_STATE* pModuleState = AfxGetModuleState();
  if (hInstance == NULL) hInstance = ::GetModuleHandleA(NULL);
  pModuleState->m_hCurrentInstanceHandle = hInstance;
  if (pModuleState->m_hCurrentResourceHandle == NULL) pModuleState->m_hCurrentResourceHandle = hInstance;

  // The main thread's message queue exists from the start, as the threads'
  // queues do (win_thread.cpp): a worker may post to it before the first
  // window or message loop.
  MSG msg;
  ::PeekMessageA(&msg, NULL, WM_USER, WM_USER, PM_NOREMOVE);

  CWinApp* pApp = AfxGetApp();
  if (pApp != NULL) {
    pApp->m_hInstance = hInstance;
    pApp->m_hPrevInstance = hPrevInstance;
    pApp->m_lpCmdLine = lpCmdLine;
    pApp->m_nCmdShow = nCmdShow;
    pApp->m_nThreadID = ::GetCurrentThreadId();
    pApp->SetCurrentHandles();
    AfxGetThreadState()->m_pCurrentThread = pApp;
  }
  return TRUE;
}

int AFXAPI AfxWinMain(HINSTANCE hInstance, HINSTANCE hPrevInstance, LPTSTR lpCmdLine, int nCmdShow) {
  int nReturnCode = -1;
  CWinThread* pThread = AfxGetThread();
  CWinApp* pApp = AfxGetApp();
  if (!AfxWinInit(hInstance, hPrevInstance, lpCmdLine, nCmdShow)) {
    AfxWinTerm();
    return nReturnCode;
  }
  pThread = AfxGetThread();
  if (pThread == NULL) {
    ::MessageBoxA(NULL, "Das Programm hat kein Anwendungsobjekt.", "", MB_ICONSTOP);
    return nReturnCode;
  }
  try {
    if (pApp != NULL && !pApp->InitApplication()) {
      AfxWinTerm();
      return nReturnCode;
    }
    if (!pThread->InitInstance()) {
      if (pThread->m_pMainWnd != NULL) pThread->m_pMainWnd->DestroyWindow();
      nReturnCode = pThread->ExitInstance();
    } else {
      nReturnCode = pThread->Run();
    }
  } catch (CException* e) {
    AfxProcessWndProcException(e, NULL);
    e->Delete();
  } catch (std::exception& e) {
    AfxReportForeignException(e.what());
  } catch (...) {
    AfxReportForeignException("unbekannte Ausnahme");
  }
  AfxWinTerm();
  return nReturnCode;
}

void AFXAPI AfxWinTerm() {
  AfxDeleteTempMaps();
  AFX_THREAD_STATE* pState = AfxGetThreadState();
  if (pState->m_hHookCbt != NULL) {
    ::UnhookWindowsHookEx(pState->m_hHookCbt);
    pState->m_hHookCbt = NULL;
  }
}
