#include "CQoMfcHelper.h"

#include <shellapi.h>
#include <cstring>

#include "CQoLog.h"
#include "resource.h"

namespace {

// A shell path list of one entry: the path, then two NUL characters.
struct ShellPath
{
    char text[CQoMfcHelper::MAX_SHELL_PATH + 2];

    bool Set(const char* path)
    {
        size_t n = strlen(path);
        if (n > CQoMfcHelper::MAX_SHELL_PATH - 1)
            return false;
        memset(text, 0, sizeof text);
        memcpy(text, path, n);
        return true;
    }
};

HWND MainWindowHandle()
{
    CWnd* main = AfxGetMainWnd();
    return main ? main->GetSafeHwnd() : NULL;
}

// Shows the application's wait cursor while the shell works.
class WaitCursor
{
public:
    WaitCursor() : m_app(AfxGetApp()) { if (m_app) m_app->BeginWaitCursor(); }
    ~WaitCursor() { if (m_app) m_app->EndWaitCursor(); }
private:
    CWinApp* m_app;
};

bool RunShellOperation(SHFILEOPSTRUCTA& op)
{
    WaitCursor wait;
    int rc = ::SHFileOperationA(&op);
    return rc == 0 && !op.fAnyOperationsAborted;
}

bool DeleteToRecycleBin(const CString& path, bool noConfirm)
{
    ShellPath from;
    if (!from.Set(path))
        return false;

    CString entry;
    entry.LoadString(IDS_LOG_DELETE);
    _theLog << (const char*)entry << (const char*)path << CQoLog::endl;

    SHFILEOPSTRUCTA op;
    memset(&op, 0, sizeof op);
    op.hwnd = MainWindowHandle();
    op.wFunc = FO_DELETE;
    op.pFrom = from.text;
    op.pTo = NULL;
    op.fFlags = FOF_ALLOWUNDO;
    if (noConfirm)
        op.fFlags |= FOF_NOCONFIRMATION;
    return RunShellOperation(op);
}

} // namespace

CQoMfcHelper::CQoMfcHelper() {}
CQoMfcHelper::CQoMfcHelper(const CQoMfcHelper&) {}
CQoMfcHelper& CQoMfcHelper::operator=(const CQoMfcHelper&) { return *this; }
CQoMfcHelper::~CQoMfcHelper() {}

bool CQoMfcHelper::RemoveDirectoryA(const CString& path, bool noConfirm)
{
    return DeleteToRecycleBin(path, noConfirm);
}

bool CQoMfcHelper::RemoveFile(const CString& path, bool noConfirm)
{
    return DeleteToRecycleBin(path, noConfirm);
}

bool CQoMfcHelper::CopyFileA(CString source, const CString& target, bool fullUi)
{
    if (source.IsEmpty() || target.IsEmpty() || strcmp(source, target) == 0)
        return true;

    ShellPath from, to;
    if (!from.Set(source) || !to.Set(target))
        return false;

    CString title;
    if (!fullUi) {
        CString format;
        format.LoadString(IDS_COPY_PROGRESS);
        title.Format(format, (const char*)source);
    }

    SHFILEOPSTRUCTA op;
    memset(&op, 0, sizeof op);
    op.hwnd = MainWindowHandle();
    op.wFunc = FO_COPY;
    op.pFrom = from.text;
    op.pTo = to.text;
    op.fFlags = FOF_MULTIDESTFILES | FOF_NOCONFIRMATION | FOF_ALLOWUNDO;
    if (!fullUi) {
        op.fFlags |= FOF_SIMPLEPROGRESS | FOF_NOERRORUI;
        op.lpszProgressTitle = title;
    }
    return RunShellOperation(op);
}

void CQoMfcHelper::ShowGetLastError(long error, const char* prefix)
{
    char* system = NULL;
    ::FormatMessageA(FORMAT_MESSAGE_ALLOCATE_BUFFER | FORMAT_MESSAGE_FROM_SYSTEM
                         | FORMAT_MESSAGE_IGNORE_INSERTS,
                     NULL, (DWORD)error, MAKELANGID(LANG_NEUTRAL, SUBLANG_DEFAULT),
                     (LPSTR)&system, 0, NULL);

    CString text;
    if (prefix && *prefix) {
        text = prefix;
        text += "\n";
    }
    if (system)
        text += system;

    ::MessageBoxA(MainWindowHandle(), text, "Error", MB_ICONERROR | MB_OK);
    if (system)
        ::LocalFree(system);
}
