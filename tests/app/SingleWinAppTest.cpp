// The single-instance application with real processes: helpers/SingleApp.cpp
// built as qo_single_a and qo_single_b (two applications). Each helper writes
// its steps into a log file; what comes to the front is checked from here.
#include <afxwin.h>

#include <gtest/gtest.h>

#include <cstdio>
#include <functional>
#include <string>
#include <vector>

#include "ThreadTestSupport.h"

namespace {

using apptest::BinDir;
using apptest::ReadLines;
using apptest::TempFile;

// Lets this thread's windows work while waiting for `done`, unless bPump is
// false.
bool WaitUntil(const std::function<bool()>& done, DWORD ms = 10000, bool bPump = true)
{
    const DWORD start = ::GetTickCount();
    for (;;) {
        if (done())
            return true;
        if (::GetTickCount() - start > ms)
            return false;
        MSG msg;
        while (bPump && ::PeekMessageA(&msg, NULL, 0, 0, PM_REMOVE)) {
            ::TranslateMessage(&msg);
            ::DispatchMessageA(&msg);
        }
        ::Sleep(20);
    }
}

// One started helper; killed when the test leaves it running.
struct Instance {
    HANDLE hProcess = NULL;
    DWORD dwPid = 0;
    ~Instance()
    {
        if (hProcess == NULL)
            return;
        if (::WaitForSingleObject(hProcess, 0) == WAIT_TIMEOUT)
            ::TerminateProcess(hProcess, 99);
        ::WaitForSingleObject(hProcess, 5000);
        ::CloseHandle(hProcess);
    }
    // The exit code, or -1 when it has not ended within ms.
    int Exit(DWORD ms = 10000)
    {
        if (::WaitForSingleObject(hProcess, ms) != WAIT_OBJECT_0)
            return -1;
        DWORD dwCode = 0;
        ::GetExitCodeProcess(hProcess, &dwCode);
        return (int)dwCode;
    }
};

void Start(Instance& inst, const char* pszApp, const std::string& strLog, const char* pszMode = "")
{
    std::string strLine = "\"" + BinDir() + "\\" + pszApp + ".exe\" \"" + strLog + "\" " + pszMode;
    STARTUPINFOA si = {};
    si.cb = sizeof(si);
    PROCESS_INFORMATION pi = {};
    ASSERT_TRUE(::CreateProcessA(NULL, &strLine[0], NULL, NULL, FALSE, 0, NULL, NULL, &si, &pi)) << strLine;
    ::CloseHandle(pi.hThread);
    inst.hProcess = pi.hProcess;
    inst.dwPid = pi.dwProcessId;
}

int CountLines(const std::string& strLog, DWORD dwPid, const std::string& strStep)
{
    int n = 0;
    std::string strPrefix = std::to_string(dwPid) + " " + strStep;
    for (const std::string& line : ReadLines(strLog))
        if (line.compare(0, strPrefix.size(), strPrefix) == 0)
            ++n;
    return n;
}

// The window that the helper named in its line "<pid> <step> <hwnd>".
HWND WaitForWindow(const std::string& strLog, DWORD dwPid, const char* pszStep)
{
    HWND hWnd = NULL;
    std::string strPrefix = std::to_string(dwPid) + " " + pszStep + " ";
    WaitUntil([&] {
        for (const std::string& line : ReadLines(strLog))
            if (line.compare(0, strPrefix.size(), strPrefix) == 0)
                hWnd = (HWND)(UINT_PTR)std::stoull(line.substr(strPrefix.size()));
        return hWnd != NULL && ::IsWindowVisible(hWnd);
    });
    return hWnd;
}

// True when hAbove lies above hBelow in the z-order of the top-level windows.
bool IsAbove(HWND hAbove, HWND hBelow)
{
    for (HWND h = ::GetWindow(hBelow, GW_HWNDPREV); h != NULL; h = ::GetWindow(h, GW_HWNDPREV))
        if (h == hAbove)
            return true;
    return false;
}

// A window of the test process that holds the foreground, above hOther,
// before a second start. The first instance may still be settling its own
// window when this one appears: raised again until it stays on top.
HWND CreateForegroundWindow(HWND hOther)
{
    HWND hWnd = ::CreateWindowExA(0, "STATIC", "Testfenster", WS_POPUP | WS_VISIBLE | WS_BORDER, 150, 150, 300, 200,
                                  NULL, NULL, ::GetModuleHandleA(NULL), NULL);
    auto onTop = [&] { return ::GetForegroundWindow() == hWnd && IsAbove(hWnd, hOther); };
    for (int i = 0; i < 20; ++i) {
        ::SetForegroundWindow(hWnd);
        ::BringWindowToTop(hWnd);
        if (WaitUntil(onTop, 500)) {
            WaitUntil([] { return false; }, 200); // late changes of the other window
            if (onTop())
                break;
        }
    }
    return hWnd;
}

void CloseInstance(Instance& inst, HWND hMain, HWND hDialog)
{
    if (hDialog != NULL)
        ::PostMessageA(hDialog, WM_COMMAND, IDCANCEL, 0);
    WaitUntil([&] { return !::IsWindow(hDialog); }, 5000);
    ::PostMessageA(hMain, WM_CLOSE, 0, 0);
}

TEST(SingleWinAppTest, SecondStartEndsAndBringsTheFirstInstanceOrItsDialogToTheFront)
{
    // Another application runs throughout: its name is its own, so A's starts
    // are not taken for its second ones, and it is never woken. A's first start
    // in the second case comes after the first case's instance ended: a first
    // instance again.
    const std::string strOtherLog = TempFile("qo_single_other.log");
    Instance other;
    ASSERT_NO_FATAL_FAILURE(Start(other, "qo_single_b", strOtherLog));
    HWND hOther = WaitForWindow(strOtherLog, other.dwPid, "ready");
    ASSERT_NE(nullptr, hOther);
    struct Case {
        const char* pszMode;
        bool bDialog;
    };
    const Case cases[] = {{"", false}, {"dialog", true}};
    for (const Case& c : cases) {
        SCOPED_TRACE(c.pszMode);
        const std::string strLog = TempFile("qo_single_front.log");
        Instance first;
        ASSERT_NO_FATAL_FAILURE(Start(first, "qo_single_a", strLog, c.pszMode));
        HWND hMain = WaitForWindow(strLog, first.dwPid, "ready");
        ASSERT_NE(nullptr, hMain) << "the first instance shows no window";
        EXPECT_EQ(0, CountLines(strLog, first.dwPid, "before"));
        HWND hDialog = c.bDialog ? WaitForWindow(strLog, first.dwPid, "dialog") : NULL;
        HWND hExpected = c.bDialog ? hDialog : hMain;
        ASSERT_NE(nullptr, hExpected);

        // Showing it made it the foreground window; let that settle first.
        EXPECT_TRUE(WaitUntil([&] { return ::GetForegroundWindow() == hExpected; }, 3000));
        HWND hOwn = CreateForegroundWindow(hExpected);
        ASSERT_EQ(hOwn, ::GetForegroundWindow());
        ASSERT_TRUE(IsAbove(hOwn, hExpected));

        Instance second;
        ASSERT_NO_FATAL_FAILURE(Start(second, "qo_single_a", strLog, c.pszMode));
        EXPECT_EQ(3, second.Exit()) << "the second instance did not end as one";
        EXPECT_EQ(0, CountLines(strLog, second.dwPid, "ready"));
        EXPECT_EQ(1, CountLines(strLog, second.dwPid, "before"));

        // Not pumping: Wine's X11 driver gives the foreground to the desktop
        // when a process handles the loss of the X focus to another process's
        // window while its own window still holds the foreground, and that
        // can come after the first instance took it.
        EXPECT_TRUE(WaitUntil([&] { return ::GetForegroundWindow() == hExpected; }, 10000, false))
            << "foreground: " << ::GetForegroundWindow();
        EXPECT_TRUE(IsAbove(hExpected, hOwn));
        EXPECT_TRUE(WaitUntil([&] { return CountLines(strLog, first.dwPid, "activated") == 1; }));

        ::DestroyWindow(hOwn);
        CloseInstance(first, hMain, hDialog);
        EXPECT_EQ(0, first.Exit());
    }
    EXPECT_EQ(0, CountLines(strOtherLog, other.dwPid, "activated"));
    CloseInstance(other, hOther, NULL);
    EXPECT_EQ(0, other.Exit());
}

} // namespace
