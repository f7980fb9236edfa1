// qoconvert - the sample conversion program of the application family.
//
//     qoconvert.exe [/batch] [project folder]
//
// The project folder (the current folder when none is given) holds the
// project's configuration file qoconvert.ini and the log qoconvert.log.
// The conversion itself is the module qoconvert_run.dll beside the program
// (see QoConvertRun.h), run on an executer thread in either mode.
//
// Interactively only one instance runs: a second start brings the running
// window to the front and ends. The main dialog lets the user choose files and
// character sets and start the conversion; the window stays live while it
// runs, shows its progress and can cancel it, and a defective input record
// opens the repair dialog. With /batch the project is converted without any
// window (and beside a running window, not instead of it): message boxes
// answer with their preset, defective records are skipped and logged, and the
// exit code is the module's result code (0 converted, 1 failed, 2 cancelled,
// 3 converted with defective records left out, 4 bad arguments).
#pragma once

#include <afxwin.h>

#include <CSingleWinApp.h>
#include <CQoString.h>

// Thread message of the executer to the program: wParam the result code.
#define WM_QOCONVERT_DONE (WM_APP + 0x42)

class CQoConvertApp : public CSingleWinApp
{
public:
    CQoConvertApp();

    virtual BOOL InitInstance();
    virtual int ExitInstance();

    // Makes `folder` (relative to the current folder unless absolute) the
    // project's, with its configuration file; the log moves with it.
    void SetProjectFolder(const CQoString& folder);
    // Starts the conversion module on an executer thread. `progress` gets its
    // progress messages (may be NULL); `cancelEvent` names the event that
    // stops it (may be empty). WM_QOCONVERT_DONE arrives when it is over.
    bool StartConversion(HWND progress, const char* cancelEvent);
    // What a result code of the module or the executer means, for the user.
    static CString ResultText(int code);

    CQoString m_projectFolder;
    CQoString m_projectFile;
    bool m_batch;

protected:
    afx_msg void OnConversionDone(WPARAM wParam, LPARAM lParam);
    DECLARE_MESSAGE_MAP()

private:
    void ParseArguments();
    int RunBatch();
    int m_exitCode;
};

extern CQoConvertApp theApp;
