#include "CExecuter.h"

#include "CQoException.h"
#include "CQoLog.h"

#include <exception>
#include <stdlib.h>
#include <string>
#include <vector>

namespace {

typedef int (*QoMainFn)(int argc, char** argv);

// An environment setting (name, '=', value) may hold at most this many characters.
const std::size_t kMaxEnvironmentSetting = 32767;

// Puts the module's folder in front of PATH for the whole process, so that
// the libraries the module loads are found next to it. A setting too long for
// the environment leaves PATH as it is.
void PutModuleFolderInPath(const std::string& strModule)
{
    std::string::size_type nSlash = strModule.rfind('\\');
    if (nSlash == std::string::npos)
        return;
    const char* pszPath = getenv("PATH");
    std::string strSetting = "PATH=" + strModule.substr(0, nSlash) + ";" + (pszPath != NULL ? pszPath : "");
    if (strSetting.size() > kMaxEnvironmentSetting) {
        _theLog << "W: Der Suchpfad bleibt unverändert, der Ordner des Konvertierungsmoduls " << strModule.c_str()
                << " passt nicht mehr hinein" << CQoLog::endl;
        return;
    }
    _putenv(strSetting.c_str()); // the C runtime keeps its own copy
}

void LogEntryException(const char* pszModule, const char* pszWhat)
{
    _theLog << "E: Das Konvertierungsmodul " << pszModule << " wurde durch eine Ausnahme beendet: " << pszWhat
            << CQoLog::endl;
}

// Loads the module named by argv[0], calls its QoMain with the arguments and
// unloads it; the entry's result goes to nEntryResult. Returns 0 or one of the
// executer's codes.
int RunModuleEntry(int& nEntryResult, int argc, char** argv)
{
    if (argc < 1 || argv == NULL || argv[0] == NULL || argv[0][0] == '\0')
        return CExecuter::errModuleNotLoaded; // no module named
    const std::string strModule = argv[0];
    PutModuleFolderInPath(strModule);

    HMODULE hModule = ::LoadLibraryA(argv[0]);
    if (hModule == NULL)
        return CExecuter::errModuleNotLoaded;

    int nCode = 0;
    QoMainFn pfnMain = reinterpret_cast<QoMainFn>(::GetProcAddress(hModule, "QoMain"));
    if (pfnMain == NULL) {
        nCode = CExecuter::errNoEntryOrNoProcess;
    } else {
        // An exception out of the module must not end the host; it is over
        // (and its object destroyed) before the module is unloaded below.
        try {
            nEntryResult = pfnMain(argc, argv);
        } catch (const CQoException& e) {
            LogEntryException(strModule.c_str(), e.Message());
            nCode = CExecuter::errEntryException;
        } catch (const std::exception& e) {
            LogEntryException(strModule.c_str(), e.what());
            nCode = CExecuter::errEntryException;
        } catch (CException* e) {
            char szText[512] = "";
            if (!e->GetErrorMessage(szText, sizeof(szText)))
                szText[0] = '\0';
            e->Delete();
            LogEntryException(strModule.c_str(), szText);
            nCode = CExecuter::errEntryException;
        } catch (...) {
            LogEntryException(strModule.c_str(), "unbekannte Ausnahme");
            nCode = CExecuter::errEntryException;
        }
    }
    ::FreeLibrary(hModule);
    return nCode;
}

} // namespace

IMPLEMENT_DYNCREATE(CExecuter, CWinThread)

BEGIN_MESSAGE_MAP(CExecuter, CWinThread)
END_MESSAGE_MAP()

CExecuter::CExecuter()
    : m_bProcess(true)
    , m_lUserValue(0)
    , m_pTargetThread(NULL)
    , m_nLaunchResult(0)
    , m_nEntryResult(0)
    , m_nCompletionMsg(0)
{
    m_bAutoDelete = TRUE;
}

CExecuter::CExecuter(bool bProcess, CWinThread* pTargetThread, UINT nCompletionMsg, long lUserValue)
    : m_bProcess(bProcess)
    , m_lUserValue(lUserValue)
    , m_pTargetThread(pTargetThread)
    , m_nLaunchResult(0)
    , m_nEntryResult(0)
    , m_nCompletionMsg(nCompletionMsg)
{
    m_bAutoDelete = TRUE;
}

CExecuter::~CExecuter()
{
    m_arrArgs.RemoveAll();
}

bool CExecuter::SetArguments(CQoArray<CQoString, CQoString&>& args)
{
    m_arrArgs.RemoveAll();
    for (int i = 0; i < args.GetSize(); ++i)
        m_arrArgs.Add(args[i]);
    return true;
}

BOOL CExecuter::InitInstance()
{
    if (m_pTargetThread == NULL)
        return FALSE;
    if (m_bProcess)
        RunProcess();
    else
        RunModule();
    return FALSE;
}

void CExecuter::RunProcess()
{
    m_nLaunchResult = errNoEntryOrNoProcess;
    if (m_arrArgs.IsEmpty())
        return;
    // Every argument in double quotes, each followed by a blank. The line is
    // built at its full length; one longer than the system takes is refused
    // by CreateProcess and reported as a failed start.
    std::string strLine;
    for (int i = 0; i < m_arrArgs.GetSize(); ++i) {
        strLine += '"';
        strLine += m_arrArgs[i].Str();
        strLine += "\" ";
    }
    std::vector<char> line(strLine.begin(), strLine.end());
    line.push_back('\0'); // CreateProcessA may write into the line

    STARTUPINFOA si;
    memset(&si, 0, sizeof(si));
    si.cb = sizeof(si);
    PROCESS_INFORMATION pi;
    memset(&pi, 0, sizeof(pi));
    if (!::CreateProcessA(NULL, line.data(), NULL, NULL, FALSE, CREATE_NEW_CONSOLE, NULL, NULL, &si, &pi))
        return;
    m_nLaunchResult = errWaitFailed;
    if (::WaitForSingleObject(pi.hProcess, INFINITE) == WAIT_OBJECT_0)
        m_nLaunchResult = 0;
    ::CloseHandle(pi.hThread);
    ::CloseHandle(pi.hProcess);
}

void CExecuter::RunModule()
{
    // Each argument in a writable copy of its own (a C main may change its
    // arguments), with the customary null pointer behind the last.
    const int argc = m_arrArgs.GetSize();
    std::vector<std::vector<char>> texts(static_cast<std::size_t>(argc));
    std::vector<char*> argv(static_cast<std::size_t>(argc) + 1, nullptr);
    for (int i = 0; i < argc; ++i) {
        std::string_view strArg = m_arrArgs[i].Str();
        texts[i].assign(strArg.begin(), strArg.end());
        texts[i].push_back('\0');
        argv[i] = texts[i].data();
    }
    m_nLaunchResult = RunModuleEntry(m_nEntryResult, argc, argv.data());
}

int CExecuter::ExitInstance()
{
    int nValue = m_nLaunchResult != 0 ? m_nLaunchResult : m_nEntryResult;
    if (m_pTargetThread != NULL)
        ::PostThreadMessageA(m_pTargetThread->m_nThreadID, m_nCompletionMsg, static_cast<WPARAM>(nValue),
                             static_cast<LPARAM>(m_lUserValue));
    return CWinThread::ExitInstance();
}
