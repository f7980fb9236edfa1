// The executer with real threads, modules and processes: helpers/TestModule.cpp
// (QoMain writes its arguments and returns argv[2] or throws),
// helpers/NoEntryModule.cpp and helpers/ArgsProgram.cpp. The completion
// message comes to this test's main thread, the application's thread.
#include <afxwin.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <atomic>
#include <cstdlib>
#include <string>
#include <vector>

#include "CExecuter.h"
#include "CQoLog.h"
#include "ThreadTestSupport.h"

namespace {

using apptest::BinDir;
using apptest::ReadLines;
using apptest::TempFile;

const UINT WM_JOB_DONE = WM_APP + 31;

std::atomic<int> g_nDeleted{0};

// Counts the executers that deleted themselves.
class CCountedExecuter : public CExecuter {
public:
    using CExecuter::CExecuter;
    ~CCountedExecuter() override { ++g_nDeleted; }
};

std::string ModuleDir() { return BinDir() + "\\modules"; }

std::string Path()
{
    const char* psz = getenv("PATH");
    return psz != NULL ? psz : "";
}

struct Result {
    bool bPosted = false, bEnded = false;   // bEnded: the thread ended and its object is gone
    int nCode = 0;
    long lUser = 0;
};

// Runs one job and waits (with a limit) for its message, its thread and the
// deletion of its object.
Result RunJob(bool bProcess, const std::vector<std::string>& args, long lUser, CWinThread* pTarget, DWORD ms = 15000)
{
    Result r;
    const int nDeletedBefore = g_nDeleted;
    CExecuter* pJob = new CCountedExecuter(bProcess, pTarget, WM_JOB_DONE, lUser);
    CQoArray<CQoString, CQoString&> arrArgs;
    for (const std::string& s : args)
        arrArgs.Add(CQoString(s.c_str()));
    EXPECT_TRUE(pJob->SetArguments(arrArgs));
    if (!pJob->CreateThread(CREATE_SUSPENDED)) {
        ADD_FAILURE() << "no thread";
        return r;
    }
    HANDLE hThread = NULL;
    ::DuplicateHandle(::GetCurrentProcess(), pJob->m_hThread, ::GetCurrentProcess(), &hThread, 0, FALSE,
                      DUPLICATE_SAME_ACCESS);
    pJob->ResumeThread(); // the object is the thread's from here on
    r.bEnded = ::WaitForSingleObject(hThread, ms) == WAIT_OBJECT_0 && g_nDeleted == nDeletedBefore + 1;
    ::CloseHandle(hThread);
    // Posted before the thread ended: it is in the queue by now, if at all.
    MSG msg;
    if (::PeekMessageA(&msg, (HWND)-1, WM_JOB_DONE, WM_JOB_DONE, PM_REMOVE)) {
        r.bPosted = true;
        r.nCode = (int)msg.wParam;
        r.lUser = (long)msg.lParam;
    }
    return r;
}

TEST(ExecuterTest, TheCodeAndTheUserValueArePostedAndLibraryModePutsTheModuleFolderFirstInPath)
{
    const std::string strModule = ModuleDir() + "\\qo_test_module.dll";
    const std::string strOut = TempFile("qo_exec_args.txt");
    const std::string strLog = TempFile("qo_exec_throw.log");
    const struct {
        const char* pszCase;
        bool bProcess;
        std::vector<std::string> args;
        int nExpected;
    } cases[] = {
        {"QoMain throws", false, {strModule, TempFile("qo_exec_throw.txt"), "throw"}, CExecuter::errEntryException},
        {"QoMain returns 7 (the module was unloaded)", false, {strModule, strOut, "7", "mit Leerzeichen"}, 7},
        {"missing module", false, {ModuleDir() + "\\fehlt.dll"}, -1},
        {"module without QoMain", false, {ModuleDir() + "\\qo_test_nomain.dll", "x"}, -2},
        {"library mode without arguments", false, {}, -1},
        {"program that does not exist", true, {BinDir() + "\\fehlt.exe"}, -2},
    };
    long lUser = -100;
    _theLog.Open(strLog.c_str());
    for (const auto& c : cases) {
        SCOPED_TRACE(c.pszCase);
        const std::string strPathBefore = Path();
        Result r = RunJob(c.bProcess, c.args, ++lUser, AfxGetApp());
        EXPECT_TRUE(r.bEnded);
        EXPECT_TRUE(r.bPosted);
        EXPECT_EQ(c.nExpected, r.nCode);
        EXPECT_EQ(lUser, r.lUser);
        if (c.args.size() < 4) continue;
        EXPECT_EQ(ModuleDir() + ";" + strPathBefore, Path());
        EXPECT_EQ((std::vector<std::string>{"4", strModule, strOut, c.args[2], "mit Leerzeichen", "(null)"}),
                  ReadLines(strOut));
    }
    _theLog.Close();
    // The exception is logged with the module and its message; the module is unloaded.
    const std::vector<std::string> logged = ReadLines(strLog);
    EXPECT_EQ(1, std::count_if(logged.begin(), logged.end(), [&](const std::string& line) {
                  return line.find(strModule) != std::string::npos && line.find("Eingabedatei nicht lesbar") != std::string::npos;
              }));
    EXPECT_EQ(NULL, ::GetModuleHandleA(strModule.c_str()));
}

TEST(ExecuterTest, ProcessModeQuotesEveryArgumentAndWaitsForTheProgram)
{
    const std::string strProgram = BinDir() + "\\qo_test_args.exe";
    const std::string strOut = TempFile("qo_exec_process.txt");
    Result r = RunJob(true, {strProgram, strOut, "zwei Worte"}, 21, AfxGetApp());
    EXPECT_TRUE(r.bEnded);
    ASSERT_TRUE(r.bPosted);
    EXPECT_EQ(0, r.nCode); // the program's own exit code (5) is not reported
    // Written before the program ended, so before the message.
    const std::vector<std::string> expected = {
        "\"" + strProgram + "\" \"" + strOut + "\" \"zwei Worte\" ", strOut, "zwei Worte"};
    EXPECT_EQ(expected, ReadLines(strOut));
}

TEST(ExecuterTest, WithoutTargetThreadNothingRunsAndNothingIsPosted)
{
    const std::string strOut = TempFile("qo_exec_notarget.txt");
    Result r = RunJob(false, {ModuleDir() + "\\qo_test_module.dll", strOut, "7"}, 5, NULL);
    EXPECT_TRUE(r.bEnded);
    EXPECT_FALSE(r.bPosted);
    EXPECT_EQ(INVALID_FILE_ATTRIBUTES, ::GetFileAttributesA(strOut.c_str())) << "the module ran";
}

} // namespace
