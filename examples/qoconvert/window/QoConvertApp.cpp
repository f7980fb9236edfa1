#include "QoConvertApp.h"

#include <CExecuter.h>
#include <CQoArray.h>
#include <CQoErrorDlg.h>
#include <CQoInterActive.h>
#include <CQoLog.h>
#include <CRepairRecordDlg.h>
#include <QoBatchMessageBox.h>

#include "../conversion/CConversion.h"
#include "CMainDlg.h"
#include "../conversion/QoConvertRun.h"

#include <csignal>
#include <cstdlib>

CQoConvertApp theApp;

BEGIN_MESSAGE_MAP(CQoConvertApp, CSingleWinApp)
    ON_THREAD_MESSAGE(WM_QOCONVERT_DONE, OnConversionDone)
END_MESSAGE_MAP()

namespace {
// Defective input records are repaired by the user while the module converts
// (on the executer thread, in a dialog without parent). The pages' previews on
// the window's thread read the same files: they keep showing a defective
// record as an error instead of opening the dialog whenever they paint.
int RepairDuringConversion(CQoString const& file, CQoString& data, int& pos)
{
    if (GetCurrentThreadId() == theApp.m_nThreadID)
        return CQoInterActive::repairNoHandler;
    return CRepairRecordDlgDoIt(file, data, pos);
}

// A program that stops itself (abort, an exception nothing catches) must not
// end with a code that reads as a result: the runtime's own code 3 is
// "converted, records left out" to whoever started the run.
extern "C" void OnAbort(int)
{
    static const char text[] = "qoconvert: Programmfehler, die Konvertierung ist nicht abgeschlossen\r\n";
    DWORD written = 0;
    WriteFile(GetStdHandle(STD_ERROR_HANDLE), text, sizeof text - 1, &written, NULL);
    _exit(qoConvertFailed);
}
}

CQoConvertApp::CQoConvertApp()
    : m_batch(false), m_exitCode(0)
{
}

void CQoConvertApp::ParseArguments()
{
    CQoString folder;
    for (int i = 1; i < __argc; ++i) {
        const char* arg = __argv[i];
        if (_stricmp(arg, "/batch") == 0 || _stricmp(arg, "-batch") == 0)
            m_batch = true;
        else
            folder = arg;
    }
    if (folder.IsEmpty()) {
        char current[MAX_PATH];
        GetCurrentDirectoryA(MAX_PATH, current);
        folder = current;
    }
    SetProjectFolder(folder);
}

void CQoConvertApp::SetProjectFolder(const CQoString& folder)
{
    m_projectFolder = folder;
    char full[MAX_PATH];
    DWORD n = GetFullPathNameA(m_projectFolder, MAX_PATH, full, NULL);
    if (n > 0 && n < MAX_PATH)
        m_projectFolder = full;
    while (m_projectFolder.GetLength() > 3
           && (m_projectFolder.Right(1) == "\\" || m_projectFolder.Right(1) == "/"))
        m_projectFolder = m_projectFolder.Left(m_projectFolder.GetLength() - 1);
    m_projectFile = m_projectFolder + "\\qoconvert.ini";
    _theLog.Open(m_projectFolder + "\\qoconvert.log");
}

BOOL CQoConvertApp::InitInstance()
{
    std::signal(SIGABRT, OnAbort);
    ParseArguments();
    // A batch run works beside a running window and beside other batch runs;
    // only the interactive program is there once.
    if (!m_batch && !CSingleWinApp::InitInstance())
        return FALSE;

    _theLog << "qoconvert gestartet, Projekt " << (const char*)m_projectFolder
            << (m_batch ? " (Batch)" : "") << CQoLog::endl;

    QoBatchMessageBoxSetMode(m_batch);
    CQoInterActive::SetQuiet(m_batch);
    if (m_batch) {
        m_exitCode = RunBatch();
        return FALSE;  // no window, no message loop
    }

    CQoInterActive::SetRepairRecord(RepairDuringConversion);
    CMainDlg dlg;
    m_pMainWnd = &dlg;
    dlg.DoModal();
    m_pMainWnd = NULL;
    return FALSE;
}

int CQoConvertApp::ExitInstance()
{
    _theLog << "qoconvert beendet mit " << (long)m_exitCode << CQoLog::endl;
    _theLog.Close();
    CSingleWinApp::ExitInstance();
    return m_exitCode;
}

bool CQoConvertApp::StartConversion(HWND progress, const char* cancelEvent)
{
    char path[MAX_PATH];
    DWORD n = GetModuleFileNameA(NULL, path, MAX_PATH);
    if (n == 0 || n >= MAX_PATH)
        return false;
    CQoString module = path;
    module = module.Left(module.ReverseFind('\\') + 1) + "qoconvert_run.dll";

    CQoArray<CQoString, CQoString&> args;
    args.Add(module);
    args.Add(m_projectFolder);
    if (m_batch)
        args.Add(CQoString("/batch"));
    if (progress != NULL) {
        CQoString option;
        option.Format("/progress=%llu", (unsigned long long)(UINT_PTR)progress);
        args.Add(option);
    }
    if (cancelEvent != NULL && *cancelEvent != '\0')
        args.Add(CQoString("/cancel=") + cancelEvent);

    CExecuter* job = new CExecuter(false, this, WM_QOCONVERT_DONE, 0);
    job->SetArguments(args);
    if (!job->CreateThread()) {
        job->Delete();
        return false;
    }
    return true;
}

CString CQoConvertApp::ResultText(int code)
{
    switch (code) {
    case qoConvertDone:      return "Konvertiert.";
    case qoConvertFailed:    return "Fehlgeschlagen.";
    case qoConvertCancelled: return "Abgebrochen; die Ausgabedatei ist unver\xE4ndert.";
    case qoConvertSkipped:   return "Konvertiert; fehlerhafte S\xE4tze wurden ausgelassen (siehe Protokoll).";
    case qoConvertUsage:     return "Fehlerhafter Aufruf des Konvertierungsmoduls.";
    case CExecuter::errModuleNotLoaded:
        return "Das Konvertierungsmodul qoconvert_run.dll kann nicht geladen werden.";
    case CExecuter::errNoEntryOrNoProcess:
        return "Das Konvertierungsmodul hat keinen Einsprungpunkt QoMain.";
    default: {
        CString text;
        text.Format("Das Konvertierungsmodul endete mit dem Code %d.", code);
        return text;
    }
    }
}

void CQoConvertApp::OnConversionDone(WPARAM wParam, LPARAM /*lParam*/)
{
    int code = (int)(INT_PTR)wParam;
    CMainDlg* window = dynamic_cast<CMainDlg*>(m_pMainWnd);
    if (window != NULL && ::IsWindow(window->m_hWnd))
        window->ConversionDone(code);
}

int CQoConvertApp::RunBatch()
{
    if (!StartConversion(NULL, NULL)) {
        QoBatchMessageBox(2106, IDOK, "Die Konvertierung kann nicht gestartet werden.", MB_OK | MB_ICONSTOP, 0);
        return qoConvertFailed;
    }
    // The executer's message ends the wait; nothing else comes to a batch run.
    MSG msg;
    while (GetMessageA(&msg, NULL, 0, 0) > 0) {
        if (msg.hwnd == NULL && msg.message == WM_QOCONVERT_DONE) {
            int code = (int)(INT_PTR)msg.wParam;
            if (code >= qoConvertDone && code <= qoConvertUsage)
                return code;
            // The module did not run: say why, in the log and on the console.
            QoBatchMessageBox(2107, IDOK, ResultText(code), MB_OK | MB_ICONSTOP, 0);
            return qoConvertFailed;
        }
        TranslateMessage(&msg);
        DispatchMessageA(&msg);
    }
    return qoConvertFailed;
}
