// The conversion module: one run of a project folder (see QoConvertRun.h).
#include "QoConvertRun.h"

#include <afxwin.h>

#include <CProjectConfig.h>
#include <CQoErrorDlg.h>
#include <CQoException.h>
#include <CQoInterActive.h>
#include <CQoLog.h>
#include <QoBatchMessageBox.h>

#include "CConversion.h"

#include <cstdlib>
#include <cstring>

namespace {
// The program's own message numbers (the log shows them).
const int kErrorConversion = 2100;
const char kProjectFile[] = "qoconvert.ini";
// Progress at most this often (milliseconds); the clock is read every
// kCheckEvery records only.
const ULONGLONG kProgressInterval = 50;
const unsigned kCheckEvery = 256;

struct RunArguments {
    CQoString folder;
    bool batch = false;
    HWND progress = NULL;
    CQoString cancel;
};

// A batch run has no window: its refusals go to the console that started it
// (attached when the process has none of its own) as well as to the log.
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

void Refuse(const RunArguments& args, int number, const char* text)
{
    if (args.batch)
        ToConsole(text);
    QoBatchMessageBox(number, IDOK, text, MB_OK | MB_ICONSTOP, 0);
}

// "/name=value": true and the value when `arg` is that option.
bool Option(const char* arg, const char* name, CQoString& value)
{
    size_t n = strlen(name);
    if (_strnicmp(arg, name, n) != 0 || arg[n] != '=')
        return false;
    value = arg + n + 1;
    return true;
}

bool ParseArguments(int argc, char** argv, RunArguments& args, CQoString& problem)
{
    for (int i = 1; i < argc; ++i) {
        const char* arg = argv[i];
        CQoString value;
        if (arg == NULL) {
            problem = "Leeres Argument.";
            return false;
        }
        if (_stricmp(arg, "/batch") == 0 || _stricmp(arg, "-batch") == 0) {
            args.batch = true;
        } else if (Option(arg, "/progress", value)) {
            char* end = NULL;
            unsigned long long handle = strtoull(value, &end, 0);
            if (value.IsEmpty() || end == NULL || *end != '\0') {
                problem.Format("Ung\xFCltiges Fenster '%s' in /progress.", (const char*)value);
                return false;
            }
            args.progress = (HWND)(UINT_PTR)handle;
        } else if (Option(arg, "/cancel", value)) {
            if (value.IsEmpty() || value.GetLength() >= MAX_PATH) {
                problem = "Der Name des Abbruch-Ereignisses fehlt oder ist zu lang.";
                return false;
            }
            args.cancel = value;
        } else if (arg[0] == '/' && arg[1] != '\0' && strchr(arg + 1, '/') == NULL && strchr(arg, '\\') == NULL) {
            problem.Format("Unbekannte Option '%s'.", arg);
            return false;
        } else if (args.folder.IsEmpty()) {
            args.folder = arg;
        } else {
            problem.Format("Mehr als ein Projektordner: '%s'.", arg);
            return false;
        }
    }
    if (args.folder.IsEmpty()) {
        problem = "Aufruf: <Projektordner> [/batch] [/progress=<Fenster>] [/cancel=<Ereignis>]";
        return false;
    }
    char full[MAX_PATH];
    DWORD n = GetFullPathNameA(args.folder, MAX_PATH, full, NULL);
    if (n > 0 && n < MAX_PATH)
        args.folder = full;
    while (args.folder.GetLength() > 3 && (args.folder.Right(1) == "\\" || args.folder.Right(1) == "/"))
        args.folder = args.folder.Left(args.folder.GetLength() - 1);
    return true;
}

// Posts progress to the window and looks at the cancel event, both at most
// every kProgressInterval: a wait on an event costs a call into the system
// (under Wine a round trip to its server), far more than a record.
class CRunProgress : public CConversionProgress
{
public:
    CRunProgress(HWND window, HANDLE cancel) : m_hWnd(window), m_hCancel(cancel) {}

    bool Advance(long records, long long position) override
    {
        if (++m_nCalls % kCheckEvery != 0)
            return true;
        ULONGLONG now = GetTickCount64();
        if (now - m_last < kProgressInterval)
            return true;
        m_last = now;
        Post(records, position);
        return m_hCancel == NULL || WaitForSingleObject(m_hCancel, 0) != WAIT_OBJECT_0;
    }
    void Post(long records, long long position)
    {
        if (m_hWnd != NULL)
            PostMessageA(m_hWnd, WM_QOCONVERT_PROGRESS, (WPARAM)records, (LPARAM)position);
    }

private:
    HWND m_hWnd;
    HANDLE m_hCancel;
    unsigned m_nCalls = 0;
    ULONGLONG m_last = 0;
};

// In batch mode no dialog may wait for a user: the host's repair hook is put
// aside for the run (the conversion skips and logs instead) and put back.
class CRepairHookAside
{
public:
    explicit CRepairHookAside(bool aside) : m_saved(CQoInterActive::GetRepairRecord()), m_bAside(aside)
    {
        if (m_bAside)
            CQoInterActive::SetRepairRecord(NULL);
    }
    ~CRepairHookAside()
    {
        if (m_bAside)
            CQoInterActive::SetRepairRecord(m_saved);
    }

private:
    CQoInterActive::RepairRecordFunc m_saved;
    bool m_bAside;
};

long long FileSize(const char* path)
{
    WIN32_FILE_ATTRIBUTE_DATA data;
    if (!GetFileAttributesExA(path, GetFileExInfoStandard, &data))
        return -1;
    return ((long long)data.nFileSizeHigh << 32) | data.nFileSizeLow;
}

int Run(const RunArguments& args)
{
    DWORD attributes = GetFileAttributesA(args.folder);
    if (attributes == INVALID_FILE_ATTRIBUTES || !(attributes & FILE_ATTRIBUTE_DIRECTORY)) {
        CString text;
        text.Format("Der Projektordner '%s' existiert nicht.", (const char*)args.folder);
        Refuse(args, 2102, text);
        return qoConvertFailed;
    }
    // The project: the folder's name below its parent folder.
    int slash = args.folder.ReverseFind('\\');
    CQoString directory = slash >= 0 ? args.folder.Left(slash + 1) : CQoString(".\\");
    CQoString name = slash >= 0 ? args.folder.Mid(slash + 1) : args.folder;
    CProjectConfig project(directory, name, kProjectFile);
    CQoString projectFile = CConversion::InFolder(args.folder, kProjectFile);
    if (!project.ReadConfigFile()) {
        CString text;
        text.Format("Die Projektdatei '%s' kann nicht gelesen werden.", (const char*)projectFile);
        Refuse(args, 2103, text);
        return qoConvertFailed;
    }
    CConversion job;
    try {
        job.ReadConfig(project.ConfigFile());
    } catch (const CQoException& e) {
        CString text;
        text.Format("Das Projekt '%s' ist fehlerhaft: %s", (const char*)projectFile, e.Text());
        Refuse(args, 2104, text);
        return qoConvertFailed;
    }
    if ((job.m_inputFile.IsEmpty() && !job.InputIsDatabase())
        || (job.m_outputFile.IsEmpty() && !job.OutputIsDatabase())) {
        CString text;
        text.Format("Im Projekt '%s' sind Eingabe- und Ausgabedatei nicht eingetragen.", (const char*)projectFile);
        Refuse(args, 2101, text);
        return qoConvertFailed;
    }
    job.PlaceInFolder(args.folder);

    HANDLE cancel = NULL;
    if (!args.cancel.IsEmpty()) {
        cancel = OpenEventA(SYNCHRONIZE, FALSE, args.cancel);
        if (cancel == NULL) {
            CString text;
            text.Format("Das Abbruch-Ereignis '%s' kann nicht ge\xF6" "ffnet werden.", (const char*)args.cancel);
            Refuse(args, 2105, text);
            return qoConvertFailed;
        }
    }
    CRunProgress progress(args.progress, cancel);
    job.SetProgress(&progress);
    job.m_bSkipDefective = args.batch;
    if (args.progress != NULL) {
        long long size = job.InputIsDatabase() ? -1 : FileSize(job.m_inputFile);
        PostMessageA(args.progress, WM_QOCONVERT_START, 0, (LPARAM)size);
    }

    int result = qoConvertFailed;
    long records = 0;
    try {
        CRepairHookAside aside(args.batch);
        records = job.Run();
        progress.Post(records, job.InputIsDatabase() ? -1 : FileSize(job.m_inputFile));
        CString done;
        done.Format("%ld S\xE4tze konvertiert nach\n%s", records,
                    (const char*)(job.OutputIsDatabase() ? job.m_outputTable : job.m_outputFile));
        // The window shows the result itself; only a batch run needs the
        // message (answered at once, into the log).
        if (args.batch)
            QoBatchMessageBox(1001, IDOK, done, MB_OK | MB_ICONINFORMATION, 0);
        else {
            CString line = done;
            line.Replace("\n", " ");
            _theLog << "H:1001 " << (const char*)line << CQoLog::endl;
        }
        result = qoConvertDone;
        if (job.SkippedRecords() > 0) {
            _theLog << "W: " << job.SkippedRecords() << " fehlerhafte S\xE4tze ausgelassen" << CQoLog::endl;
            result = qoConvertSkipped;
        }
    } catch (const CConversionCancelled&) {
        _theLog << "Konvertierung abgebrochen nach " << records << " S\xE4tzen; die Ausgabe ist unver\xE4ndert"
                << CQoLog::endl;
        result = qoConvertCancelled;
    } catch (const CQoException& e) {
        if (args.batch)
            Refuse(args, kErrorConversion, e.Message());   // no window: console and log
        else
            CQoErrorDlg::ShowError(kErrorConversion, e.Message());
        result = qoConvertFailed;
    }
    if (cancel != NULL)
        CloseHandle(cancel);
    return result;
}
}

extern "C" __declspec(dllexport) int QoMain(int argc, char** argv)
{
    RunArguments args;
    CQoString problem;
    if (!ParseArguments(argc, argv, args, problem)) {
        // No project, so no log of its own: the console and the host's log.
        if (args.batch)
            ToConsole(problem);
        _theLog << "qoconvert_run: " << (const char*)problem << CQoLog::endl;
        return qoConvertUsage;
    }
    if (args.batch) {
        QoBatchMessageBoxSetMode(true);
        CQoInterActive::SetQuiet(true);
    }
    _theLog.Open(CConversion::InFolder(args.folder, "qoconvert.log"));
    CQoErrorDlg::AddMessage(kErrorConversion, "Die Konvertierung ist fehlgeschlagen.");
    _theLog << "Konvertierung von " << (const char*)args.folder << (args.batch ? " (Batch)" : "") << CQoLog::endl;
    int result;
    try {
        result = Run(args);
    } catch (const CQoException& e) {
        // A failure outside the conversion proper (the project file, say).
        Refuse(args, kErrorConversion, e.Message());
        result = qoConvertFailed;
    }
    _theLog << "Konvertierung beendet mit " << (long)result << CQoLog::endl;
    return result;
}
