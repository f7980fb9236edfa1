#include "QoConvertApp.h"

#include <CQoConfigFile.h>
#include <CQoErrorDlg.h>
#include <CQoException.h>
#include <CQoInterActive.h>
#include <CQoLog.h>
#include <QoBatchMessageBox.h>

#include "CConversion.h"
#include "CMainDlg.h"
#include "resource.h"

CQoConvertApp theApp;

namespace {
// The program's own error numbers.
const int kErrorConversion = 2100;

// File names in the project may be relative to the project folder.
CQoString InFolder(const CQoString& folder, const CQoString& file)
{
    bool absolute = (file.GetLength() >= 2 && file.GetAt(1) == ':')
                    || (!file.IsEmpty() && (file.GetAt(0) == '\\' || file.GetAt(0) == '/'));
    return absolute || file.IsEmpty() ? file : folder + "\\" + file;
}

// The value of Database= or DBQ= in a connect string, made absolute against
// the project folder like the file names.
CQoString ConnectInProject(const CQoString& folder, const CQoString& connect)
{
    CQoString result;
    int start = 0;
    while (start <= connect.GetLength()) {
        int end = connect.Find(';', start);
        if (end < 0)
            end = connect.GetLength();
        CQoString part = connect.Mid(start, end - start);
        int equals = part.Find('=');
        if (equals > 0) {
            CQoString key = part.Left(equals);
            key.Trim();
            if (_stricmp(key, "Database") == 0 || _stricmp(key, "DBQ") == 0)
                part = part.Left(equals + 1) + InFolder(folder, part.Mid(equals + 1));
        }
        if (!result.IsEmpty() || start > 0)
            result += ";";
        result += part;
        start = end + 1;
    }
    return result;
}

// A batch run has no window: its errors go to the console that started it
// (attached when the program has none of its own) as well as to the log.
void ToConsole(const char* text)
{
    HANDLE err = GetStdHandle(STD_ERROR_HANDLE);
    if (err == NULL || err == INVALID_HANDLE_VALUE) {
        if (!AttachConsole(ATTACH_PARENT_PROCESS))
            return;
        err = GetStdHandle(STD_ERROR_HANDLE);
        if (err == NULL || err == INVALID_HANDLE_VALUE)
            return;
    }
    // The console shows OEM characters; the program's texts are Ansi.
    CString line = text;
    line += "\r\n";
    CharToOemBuffA(line.GetBuffer(), line.GetBuffer(), (DWORD)line.GetLength());
    line.ReleaseBuffer();
    DWORD written = 0;
    WriteFile(err, (const char*)line, (DWORD)line.GetLength(), &written, NULL);
}
}

CQoString CQoConvertApp::InProject(const CQoString& file) const
{
    return InFolder(m_projectFolder, file);
}

CQoConvertApp::CQoConvertApp()
    : m_batch(false), m_exitCode(0)
{
}

void CQoConvertApp::ParseArguments()
{
    for (int i = 1; i < __argc; ++i) {
        const char* arg = __argv[i];
        if (_stricmp(arg, "/batch") == 0 || _stricmp(arg, "-batch") == 0)
            m_batch = true;
        else
            m_projectFolder = arg;
    }
    if (m_projectFolder.IsEmpty()) {
        char current[MAX_PATH];
        GetCurrentDirectoryA(MAX_PATH, current);
        m_projectFolder = current;
    }
    char full[MAX_PATH];
    DWORD n = GetFullPathNameA(m_projectFolder, MAX_PATH, full, NULL);
    if (n > 0 && n < MAX_PATH)
        m_projectFolder = full;
    while (m_projectFolder.GetLength() > 3
           && (m_projectFolder.Right(1) == "\\" || m_projectFolder.Right(1) == "/"))
        m_projectFolder = m_projectFolder.Left(m_projectFolder.GetLength() - 1);
    m_projectFile = m_projectFolder + "\\qoconvert.ini";
}

BOOL CQoConvertApp::InitInstance()
{
    ParseArguments();

    CQoString log = m_projectFolder + "\\qoconvert.log";
    _theLog.Open(log);
    _theLog << "qoconvert gestartet, Projekt " << (const char*)m_projectFolder
            << (m_batch ? " (Batch)" : "") << CQoLog::endl;

    QoBatchMessageBoxSetMode(m_batch);
    CQoInterActive::SetQuiet(m_batch);
    CQoErrorDlg::AddMessage(kErrorConversion, "Die Konvertierung ist fehlgeschlagen.");

    if (m_batch) {
        m_exitCode = Convert() ? 0 : 1;
        return FALSE;  // no window, no message loop
    }

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
    CWinApp::ExitInstance();
    return m_exitCode;
}

void CQoConvertApp::Refuse(int number, const char* text)
{
    if (m_batch)
        ToConsole(text);
    QoBatchMessageBox(number, IDOK, text, MB_OK | MB_ICONSTOP, 0);
}

bool CQoConvertApp::Convert()
{
    DWORD attributes = GetFileAttributesA(m_projectFolder);
    if (attributes == INVALID_FILE_ATTRIBUTES || !(attributes & FILE_ATTRIBUTE_DIRECTORY)) {
        CString text;
        text.Format(IDS_NO_FOLDER, (const char*)m_projectFolder);
        Refuse(2102, text);
        return false;
    }
    CQoConfigFile config;
    if (!config.Open(m_projectFile)) {
        CString text;
        text.Format(IDS_CANNOT_READ, (const char*)m_projectFile);
        Refuse(2103, text);
        return false;
    }
    CConversion job;
    try {
        job.ReadConfig(config);
    } catch (const CQoException& e) {
        CString text;
        text.Format(IDS_BAD_PROJECT, (const char*)m_projectFile, e.Text());
        Refuse(2104, text);
        return false;
    }
    if ((job.m_inputFile.IsEmpty() && !job.InputIsDatabase())
        || (job.m_outputFile.IsEmpty() && !job.OutputIsDatabase())) {
        CString text;
        text.Format(IDS_NO_PROJECT, (const char*)m_projectFile);
        Refuse(2101, text);
        return false;
    }

    job.m_inputFile = InProject(job.m_inputFile);
    job.m_outputFile = InProject(job.m_outputFile);
    // Database files named in a connect string are relative to the project too.
    job.m_inputConnect = ConnectInProject(m_projectFolder, job.m_inputConnect);
    job.m_outputConnect = ConnectInProject(m_projectFolder, job.m_outputConnect);
    job.m_inputDatabase = InProject(job.m_inputDatabase);
    job.m_outputDatabase = InProject(job.m_outputDatabase);
    try {
        CWaitCursor wait;
        long records = job.Run();
        CString done;
        done.Format(IDS_DONE, records, (const char*)job.m_outputFile);
        QoBatchMessageBox(1001, IDOK, done, MB_OK | MB_ICONINFORMATION, 0);
        return true;
    } catch (const CQoException& e) {
        if (m_batch) {
            // No window in batch mode: the console and the log say why.
            Refuse(kErrorConversion, e.Message());
        } else {
            CQoErrorDlg::ShowError(kErrorConversion, e.Message());
        }
        return false;
    }
}
