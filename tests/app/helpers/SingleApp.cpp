// A single-instance application for the tests: a main window, and with the
// argument "dialog" a modal dialog over it. Every step goes as one line into
// the log file named by the first argument, with the process id in front:
//   <pid> ready <main window>   <pid> dialog <dialog window>
//   <pid> activated             <pid> before
//   <pid> exit <code>
// A second instance ends with exit code 3.
#include <afxwin.h>

#include <cstdio>
#include <cstring>
#include <string>

#include "CSingleWinApp.h"
#include "SingleAppRes.h"

namespace {

const UINT WM_OPEN_DIALOG = WM_APP + 1;

std::string g_strLog;

void LogLine(const char* pszText, HWND hWnd = NULL)
{
    FILE* f = std::fopen(g_strLog.c_str(), "a");
    if (f == NULL)
        return;
    if (hWnd != NULL)
        std::fprintf(f, "%lu %s %llu\n", ::GetCurrentProcessId(), pszText, (unsigned long long)(UINT_PTR)hWnd);
    else
        std::fprintf(f, "%lu %s\n", ::GetCurrentProcessId(), pszText);
    std::fclose(f);
}

class CSettingsDlg : public CDialog {
public:
    CSettingsDlg(CWnd* pParent) : CDialog(IDD_SINGLE_DIALOG, pParent) {}

protected:
    BOOL OnInitDialog() override
    {
        CDialog::OnInitDialog();
        LogLine("dialog", m_hWnd);
        return TRUE;
    }
};

class CMainWindow : public CWnd {
protected:
    afx_msg LRESULT OnOpenDialog(WPARAM, LPARAM)
    {
        CSettingsDlg dlg(this);
        dlg.DoModal();
        return 0;
    }
    void PostNcDestroy() override { delete this; }
    DECLARE_MESSAGE_MAP()
};

BEGIN_MESSAGE_MAP(CMainWindow, CWnd)
    ON_MESSAGE(WM_OPEN_DIALOG, OnOpenDialog)
END_MESSAGE_MAP()

class CSingleTestApp : public CSingleWinApp {
public:
    BOOL InitInstance() override
    {
        if (__argc >= 2)
            g_strLog = __argv[1];
        if (!CSingleWinApp::InitInstance()) {
            m_bSecond = true;
            return FALSE;
        }
        CMainWindow* pWnd = new CMainWindow;
        std::string strTitle = std::string("Einzelinstanz ") + AfxGetAppName();
        if (!pWnd->CreateEx(0, AfxRegisterWndClass(0, ::LoadCursor(NULL, IDC_ARROW), (HBRUSH)(COLOR_WINDOW + 1)),
                            strTitle.c_str(), WS_OVERLAPPEDWINDOW | WS_VISIBLE, 100, 100, 400, 300, NULL, NULL)) {
            delete pWnd;
            return FALSE;
        }
        m_pMainWnd = pWnd;
        pWnd->UpdateWindow();
        LogLine("ready", pWnd->m_hWnd);
        if (__argc >= 3 && std::strcmp(__argv[2], "dialog") == 0)
            pWnd->PostMessage(WM_OPEN_DIALOG);
        return TRUE;
    }

    int ExitInstance() override
    {
        int nCode = m_bSecond ? 3 : CSingleWinApp::ExitInstance();
        char szLine[32];
        std::snprintf(szLine, sizeof(szLine), "exit %d", nCode);
        LogLine(szLine);
        return nCode;
    }

protected:
    void OnActivatedBySecondApp() override { LogLine("activated"); }
    void BeforeActivateFirstApp() override { LogLine("before"); }

private:
    bool m_bSecond = false;
};

CSingleTestApp theApp;

} // namespace
