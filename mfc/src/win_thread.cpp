// CWinThread: user-interface and worker threads, the message loop and the
// routing of thread messages through the thread's message map.
#include "afxpriv.h"

#include <exception>
#include <process.h>

IMPLEMENT_DYNAMIC(CWinThread, CCmdTarget)

BEGIN_MESSAGE_MAP(CWinThread, CCmdTarget)
END_MESSAGE_MAP()

void CWinThread::CommonConstruct() {
  m_pMainWnd = NULL;
  m_pActiveWnd = NULL;
  m_bAutoDelete = TRUE;
  m_hThread = NULL;
  m_nThreadID = 0;
  memset(&m_msgCur, 0, sizeof(m_msgCur));
}

CWinThread::CWinThread() : m_pThreadParams(NULL), m_pfnThreadProc(NULL) { CommonConstruct(); }

CWinThread::CWinThread(AFX_THREADPROC pfnThreadProc, LPVOID pParam)
    : m_pThreadParams(pParam), m_pfnThreadProc(pfnThreadProc) {
  CommonConstruct();
}

CWinThread::~CWinThread() {
  if (m_hThread != NULL && m_hThread != INVALID_HANDLE_VALUE && this != (CWinThread*)AfxGetApp())
    ::CloseHandle(m_hThread);
  AFX_THREAD_STATE* pState = AfxGetThreadState();
  if (pState->m_pCurrentThread == this) pState->m_pCurrentThread = NULL;
}

namespace {

struct STARTUP {
  CWinThread* pThread;
  HANDLE hEvent;  // the thread has its queue
  HANDLE hEvent2; // the creator is done with the start-up
};

} // namespace

// The entry of every thread made by CWinThread::CreateThread.
static unsigned __stdcall AfxThreadEntry(void* pParam) {
  STARTUP* pStartup = (STARTUP*)pParam;
  CWinThread* pThread = pStartup->pThread;
  AFX_THREAD_STATE* pState = AfxGetThreadState();
  pState->m_pCurrentThread = pThread;
  MSG msg;
  ::PeekMessageA(&msg, NULL, WM_USER, WM_USER, PM_NOREMOVE); // creates the message queue
  HANDLE hEvent2 = pStartup->hEvent2;
  ::SetEvent(pStartup->hEvent);
  // pStartup lives on the creator's stack: not touched after this point.
  ::WaitForSingleObject(hEvent2, INFINITE);
  ::CloseHandle(hEvent2);

  UINT nResult = 0;
  try {
    if (pThread->m_pfnThreadProc != NULL) {
      nResult = pThread->m_pfnThreadProc(pThread->m_pThreadParams);
    } else if (!pThread->InitInstance()) {
      nResult = pThread->ExitInstance();
    } else {
      nResult = pThread->Run();
    }
  } catch (CException* e) {
    AfxProcessWndProcException(e, NULL);
    e->Delete();
    nResult = (UINT)-1;
  } catch (std::exception& e) {
    AfxReportForeignException(e.what());
    nResult = (UINT)-1;
  } catch (...) {
    AfxReportForeignException("unbekannte Ausnahme");
    nResult = (UINT)-1;
  }
  AfxEndThread(nResult);
  return nResult;
}

BOOL CWinThread::CreateThread(DWORD dwCreateFlags, UINT nStackSize, LPSECURITY_ATTRIBUTES lpSecurityAttrs) {
  ASSERT(m_hThread == NULL);
  STARTUP startup;
  startup.pThread = this;
  startup.hEvent = ::CreateEventA(NULL, TRUE, FALSE, NULL);
  startup.hEvent2 = ::CreateEventA(NULL, TRUE, FALSE, NULL);
  if (startup.hEvent == NULL || startup.hEvent2 == NULL) {
    if (startup.hEvent) ::CloseHandle(startup.hEvent);
    if (startup.hEvent2) ::CloseHandle(startup.hEvent2);
    return FALSE;
  }
  unsigned nThreadID = 0;
  m_hThread = (HANDLE)_beginthreadex(lpSecurityAttrs, nStackSize, &AfxThreadEntry, &startup,
                                     (dwCreateFlags | CREATE_SUSPENDED) & (CREATE_SUSPENDED | STACK_SIZE_PARAM_IS_A_RESERVATION),
                                     &nThreadID);
  if (m_hThread == NULL) {
    ::CloseHandle(startup.hEvent);
    ::CloseHandle(startup.hEvent2);
    return FALSE;
  }
  m_nThreadID = nThreadID;
  ::ResumeThread(m_hThread);
  ::WaitForSingleObject(startup.hEvent, INFINITE);
  ::CloseHandle(startup.hEvent);
  // The thread now waits for hEvent2; a suspended start keeps it there until ResumeThread.
  if (dwCreateFlags & CREATE_SUSPENDED) ::SuspendThread(m_hThread);
  ::SetEvent(startup.hEvent2); // the thread closes it
  return TRUE;
}

int CWinThread::GetThreadPriority() { return ::GetThreadPriority(m_hThread); }
BOOL CWinThread::SetThreadPriority(int nPriority) { return ::SetThreadPriority(m_hThread, nPriority); }
DWORD CWinThread::SuspendThread() { return ::SuspendThread(m_hThread); }
DWORD CWinThread::ResumeThread() { return ::ResumeThread(m_hThread); }
BOOL CWinThread::PostThreadMessage(UINT message, WPARAM wParam, LPARAM lParam) {
  return ::PostThreadMessageA(m_nThreadID, message, wParam, lParam);
}

BOOL CWinThread::InitInstance() { return FALSE; } // a user-interface thread must override this

int CWinThread::ExitInstance() { return (int)m_msgCur.wParam; }

CWnd* CWinThread::GetMainWnd() {
  if (m_pActiveWnd != NULL) return m_pActiveWnd;
  return m_pMainWnd;
}

void CWinThread::Delete() {
  if (m_bAutoDelete) delete this;
}

BOOL CWinThread::IsIdleMessage(MSG* pMsg) {
  // Mouse moves to the same place and the caret blink do not end idle time.
  static thread_local POINT ptLast = {-1, -1};
  if (pMsg->message == WM_MOUSEMOVE || pMsg->message == WM_NCMOUSEMOVE) {
    if (pMsg->pt.x == ptLast.x && pMsg->pt.y == ptLast.y) return FALSE;
    ptLast = pMsg->pt;
    return TRUE;
  }
  return pMsg->message != WM_PAINT && pMsg->message != 0x0118; // WM_SYSTIMER
}

BOOL CWinThread::OnIdle(LONG lCount) {
  if (lCount >= 1) AfxDeleteTempMaps();
  return lCount < 1;
}

int CWinThread::Run() {
  BOOL bIdle = TRUE;
  LONG lIdleCount = 0;
  for (;;) {
    while (bIdle && !::PeekMessageA(&m_msgCur, NULL, 0, 0, PM_NOREMOVE)) {
      if (!OnIdle(lIdleCount++)) bIdle = FALSE;
    }
    do {
      if (!PumpMessage()) return ExitInstance();
      if (IsIdleMessage(&m_msgCur)) {
        bIdle = TRUE;
        lIdleCount = 0;
      }
    } while (::PeekMessageA(&m_msgCur, NULL, 0, 0, PM_NOREMOVE));
  }
}

BOOL CWinThread::PumpMessage() {
  if (!::GetMessageA(&m_msgCur, NULL, 0, 0)) return FALSE;
  // Thread messages and PreTranslateMessage run outside any window procedure:
  // their exceptions are caught here.
  try {
    if (!PreTranslateMessage(&m_msgCur)) {
      ::TranslateMessage(&m_msgCur);
      ::DispatchMessageA(&m_msgCur);
    }
  } catch (CException* e) {
    AfxProcessWndProcException(e, &m_msgCur);
    e->Delete();
  } catch (std::exception& e) {
    AfxReportForeignException(e.what());
  } catch (...) {
    AfxReportForeignException("unbekannte Ausnahme");
  }
  return TRUE;
}

BOOL CWinThread::PreTranslateMessage(MSG* pMsg) {
  if (pMsg->hwnd == NULL && DispatchThreadMessageEx(pMsg)) return TRUE;
  CWnd* pMainWnd = AfxGetMainWnd();
  if (CWnd::WalkPreTranslateTree(pMainWnd->GetSafeHwnd(), pMsg)) return TRUE;
  // The main window sees messages of other top-level windows too (accelerators).
  if (pMainWnd != NULL && pMsg->hwnd != NULL && ::IsWindow(pMainWnd->m_hWnd)) {
    HWND hTop = ::GetAncestor(pMsg->hwnd, GA_ROOT);
    if (hTop != pMainWnd->m_hWnd && pMainWnd->PreTranslateMessage(pMsg)) return TRUE;
  }
  return FALSE;
}

BOOL CWinThread::DispatchThreadMessageEx(MSG* pMsg) {
  const AFX_MSGMAP_ENTRY* lpEntry = AfxFindWindowMessage(GetMessageMap(), pMsg->message);
  if (lpEntry == NULL) return FALSE;
  MessageMapFunctions mmf;
  mmf.pfn = lpEntry->pfn;
  (this->*mmf.pfn_THREAD)(pMsg->wParam, pMsg->lParam);
  return TRUE;
}

LRESULT CWinThread::ProcessWndProcException(CException* e, const MSG* pMsg) {
  if (pMsg != NULL && pMsg->message == WM_PAINT) ::ValidateRect(pMsg->hwnd, NULL); // no endless repaint
  // A CUserException has already told the user.
  if (!e->IsKindOf(RUNTIME_CLASS(CUserException))) e->ReportError(MB_ICONSTOP, AFX_IDP_INTERNAL_FAILURE);
  if (pMsg != NULL && pMsg->message == WM_CREATE) return -1; // creation fails
  return 0;
}

// ---------------------------------------------------------------------------
// Free functions
// ---------------------------------------------------------------------------

CWinThread* AFXAPI AfxGetThread() {
  AFX_THREAD_STATE* pState = AfxGetThreadState();
  if (pState->m_pCurrentThread != NULL) return pState->m_pCurrentThread;
  // The main thread without an entry of its own: the application object.
  CWinApp* pApp = AfxGetApp();
  if (pApp != NULL && pApp->m_nThreadID == ::GetCurrentThreadId()) return pApp;
  return NULL;
}

CWinThread* AFXAPI AfxBeginThread(AFX_THREADPROC pfnThreadProc, LPVOID pParam, int nPriority, UINT nStackSize,
                                  DWORD dwCreateFlags, LPSECURITY_ATTRIBUTES lpSecurityAttrs) {
  ASSERT(pfnThreadProc != NULL);
  CWinThread* pThread = new CWinThread(pfnThreadProc, pParam);
  if (!pThread->CreateThread(dwCreateFlags | CREATE_SUSPENDED, nStackSize, lpSecurityAttrs)) {
    pThread->Delete();
    return NULL;
  }
  pThread->SetThreadPriority(nPriority);
  if (!(dwCreateFlags & CREATE_SUSPENDED)) pThread->ResumeThread();
  return pThread;
}

CWinThread* AFXAPI AfxBeginThread(CRuntimeClass* pThreadClass, int nPriority, UINT nStackSize, DWORD dwCreateFlags,
                                  LPSECURITY_ATTRIBUTES lpSecurityAttrs) {
  ASSERT(pThreadClass != NULL && pThreadClass->IsDerivedFrom(RUNTIME_CLASS(CWinThread)));
  CWinThread* pThread = (CWinThread*)pThreadClass->CreateObject();
  if (pThread == NULL) AfxThrowMemoryException();
  if (!pThread->CreateThread(dwCreateFlags | CREATE_SUSPENDED, nStackSize, lpSecurityAttrs)) {
    pThread->Delete();
    return NULL;
  }
  pThread->SetThreadPriority(nPriority);
  if (!(dwCreateFlags & CREATE_SUSPENDED)) pThread->ResumeThread();
  return pThread;
}

void AFXAPI AfxEndThread(UINT nExitCode, BOOL bDelete) {
  AFX_THREAD_STATE* pState = AfxGetThreadState();
  CWinThread* pThread = pState->m_pCurrentThread;
  if (pThread != NULL) {
    ASSERT(pThread != (CWinThread*)AfxGetApp());
    pState->m_pCurrentThread = NULL;
    if (bDelete) pThread->Delete();
  }
  AfxTermThreadState();
  _endthreadex(nExitCode);
}

BOOL AFXAPI AfxPreTranslateMessage(MSG* pMsg) {
  CWinThread* pThread = AfxGetThread();
  if (pThread != NULL) return pThread->PreTranslateMessage(pMsg);
  if (pMsg->hwnd == NULL) return FALSE;
  return CWnd::WalkPreTranslateTree(NULL, pMsg);
}

BOOL AFXAPI AfxPumpMessage() {
  CWinThread* pThread = AfxGetThread();
  if (pThread != NULL) return pThread->PumpMessage();
  MSG msg;
  if (!::GetMessageA(&msg, NULL, 0, 0)) return FALSE;
  if (!AfxPreTranslateMessage(&msg)) {
    ::TranslateMessage(&msg);
    ::DispatchMessageA(&msg);
  }
  return TRUE;
}

void AFXAPI AfxPostQuitMessage(int nExitCode) { ::PostQuitMessage(nExitCode); }
