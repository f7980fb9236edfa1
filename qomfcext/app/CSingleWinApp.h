// CSingleWinApp - an application class that lets one instance of an
// application run at a time.
//
// Instances find each other through a named auto-reset event that carries the
// application's name. The first instance keeps a small watcher thread that
// waits for the event; a later start signals it and ends, and the first
// instance answers in its main thread: its main window (or that window's open
// modal dialog) comes to the front and OnActivatedBySecondApp runs.
//
//     class CMyApp : public CSingleWinApp {
//         BOOL InitInstance() override
//         {
//             if (!CSingleWinApp::InitInstance())
//                 return FALSE;            // a second start: end at once
//             ... create the main window ...
//         }
//         void OnActivatedBySecondApp() override { ... open the new file ... }
//     };
//
// The main thread must pump its messages through the application's loop (or
// an MFC modal loop) for the wake-up to arrive: it is a thread message.
#pragma once

#include <afxmt.h>
#include <afxwin.h>

#include "QoMfcExtApi.h"

class QOMFCEXT_API CSingleWinApp : public CWinApp
{
    DECLARE_DYNCREATE(CSingleWinApp)
    friend class CSingleWinAppActivationWatcher;

public:
    // The registered thread message ("CSingleWinApp") that wakes the first instance.
    UINT MsgActivate() const;

protected:
    CSingleWinApp();
    virtual ~CSingleWinApp();

    CSingleWinApp(const CSingleWinApp&) = delete;
    CSingleWinApp& operator=(const CSingleWinApp&) = delete;

    // FALSE in a second instance, which must then end; does not call
    // CWinApp::InitInstance.
    BOOL InitInstance() override;
    int Run() override;
    int ExitInstance() override;

    // Virtual functions you might override
    // In the first instance, after its window came to the front.
    virtual void OnActivatedBySecondApp();
    // In a second instance, before it wakes the first one.
    virtual void BeforeActivateFirstApp();

    afx_msg void OnActivate(WPARAM wParam, LPARAM lParam);
    DECLARE_MESSAGE_MAP()

private:
    CWinThread* m_pWatcherThread;  // deletes itself when its thread ends
    CEvent* m_pStopEvent;
    CEvent* m_pActivateEvent;
    HANDLE m_hWatcherThread;       // our own handle of the watcher's thread
};
