#include "CSingleWinApp.h"

#include "CSingleWinAppActivationWatcher.h"

namespace {

// Registered when the library is loaded, before any instance exists.
UINT g_nMsgActivate = ::RegisterWindowMessageA("CSingleWinApp");

} // namespace

IMPLEMENT_DYNCREATE(CSingleWinApp, CWinApp)

BEGIN_MESSAGE_MAP(CSingleWinApp, CWinApp)
    ON_REGISTERED_THREAD_MESSAGE(g_nMsgActivate, OnActivate)
END_MESSAGE_MAP()

CSingleWinApp::CSingleWinApp()
    : CWinApp(NULL)
    , m_pWatcherThread(NULL)
    , m_pStopEvent(NULL)
    , m_pActivateEvent(NULL)
    , m_hWatcherThread(NULL)
{
}

CSingleWinApp::~CSingleWinApp()
{
    if (m_pStopEvent != NULL) {
        m_pStopEvent->SetEvent();
        // The watcher deletes itself, and its object closes its thread handle
        // then: the wait uses a duplicate taken before the watcher could run.
        if (m_hWatcherThread != NULL) {
            ::WaitForSingleObject(m_hWatcherThread, INFINITE);
            ::CloseHandle(m_hWatcherThread);
            m_hWatcherThread = NULL;
        }
        m_pWatcherThread = NULL;
        delete m_pStopEvent;
        m_pStopEvent = NULL;
    }
    if (m_pActivateEvent != NULL) {
        delete m_pActivateEvent;
        m_pActivateEvent = NULL;
    }
}

UINT CSingleWinApp::MsgActivate() const
{
    return g_nMsgActivate;
}

BOOL CSingleWinApp::InitInstance()
{
    ASSERT(m_pActivateEvent == NULL); // once per application object
    LPCTSTR lpszName = AfxGetAppName();
    m_pActivateEvent = new CEvent(FALSE, FALSE, lpszName);
    if (::GetLastError() != ERROR_ALREADY_EXISTS) {
        m_pStopEvent = new CEvent(FALSE, FALSE);
        // Started suspended for a moment: the duplicate of its handle must
        // exist before the thread can end and close its own.
        m_pWatcherThread = AfxBeginThread(RUNTIME_CLASS(CSingleWinAppActivationWatcher), THREAD_PRIORITY_NORMAL, 0,
                                          CREATE_SUSPENDED, NULL);
        if (m_pWatcherThread != NULL) {
            if (!::DuplicateHandle(::GetCurrentProcess(), m_pWatcherThread->m_hThread, ::GetCurrentProcess(),
                                   &m_hWatcherThread, SYNCHRONIZE, FALSE, 0))
                m_hWatcherThread = NULL;
            m_pWatcherThread->ResumeThread();
        }
        return TRUE;
    }
    BeforeActivateFirstApp();
    m_pActivateEvent->SetEvent();
    return FALSE;
}

int CSingleWinApp::Run()
{
    return CWinApp::Run();
}

int CSingleWinApp::ExitInstance()
{
    return CWinApp::ExitInstance();
}

void CSingleWinApp::OnActivatedBySecondApp() {}

void CSingleWinApp::BeforeActivateFirstApp() {}

void CSingleWinApp::OnActivate(WPARAM, LPARAM)
{
    CWnd* pMainWnd = AfxGetMainWnd();
    if (pMainWnd != NULL && ::IsWindow(pMainWnd->m_hWnd)) {
        // A minimized window stays minimized.
        CWnd* pPopup = pMainWnd->GetLastActivePopup();
        pPopup->BringWindowToTop();
        pPopup->SetForegroundWindow();
    }
    OnActivatedBySecondApp();
}
