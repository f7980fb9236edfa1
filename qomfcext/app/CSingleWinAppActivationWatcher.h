// CSingleWinAppActivationWatcher - the thread of a first instance of a
// CSingleWinApp that waits for later starts.
//
// It waits on the application's activation event and stop event; each time a
// later start signals the activation event it posts the activation message to
// the application's main thread, and when the stop event is signalled it ends
// without ever entering a message loop. It deletes itself when its thread ends.
// Only CSingleWinApp::InitInstance starts it.
#pragma once

#include <afxwin.h>

class CSingleWinAppActivationWatcher : public CWinThread
{
    DECLARE_DYNCREATE(CSingleWinAppActivationWatcher)

protected:
    CSingleWinAppActivationWatcher();
    virtual ~CSingleWinAppActivationWatcher();

    // Waits until the stop event; returns FALSE so that the thread ends.
    BOOL InitInstance() override;
    int ExitInstance() override;

    DECLARE_MESSAGE_MAP()
};
