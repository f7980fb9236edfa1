#include "CSingleWinAppActivationWatcher.h"

#include "CSingleWinApp.h"

IMPLEMENT_DYNCREATE(CSingleWinAppActivationWatcher, CWinThread)

BEGIN_MESSAGE_MAP(CSingleWinAppActivationWatcher, CWinThread)
END_MESSAGE_MAP()

CSingleWinAppActivationWatcher::CSingleWinAppActivationWatcher() {}

CSingleWinAppActivationWatcher::~CSingleWinAppActivationWatcher() {}

BOOL CSingleWinAppActivationWatcher::InitInstance()
{
    // The application object outlives this thread: its destructor signals the
    // stop event and waits for the thread to end before the events go.
    CSingleWinApp* pApp = static_cast<CSingleWinApp*>(AfxGetApp());
    ASSERT(pApp != NULL && pApp->m_pActivateEvent != NULL && pApp->m_pStopEvent != NULL);
    CSyncObject* objects[2] = {pApp->m_pActivateEvent, pApp->m_pStopEvent};
    CMultiLock lock(objects, 2);
    for (;;) {
        DWORD dwResult = lock.Lock(INFINITE, FALSE, 0);
        if (dwResult == WAIT_OBJECT_0)
            pApp->PostThreadMessage(pApp->MsgActivate(), 0, 0);
        else if (dwResult == WAIT_OBJECT_0 + 1)
            return FALSE;
        else if (dwResult == WAIT_FAILED)
            return FALSE; // a handle went bad: waiting again would only spin
    }
}

int CSingleWinAppActivationWatcher::ExitInstance()
{
    return CWinThread::ExitInstance();
}
