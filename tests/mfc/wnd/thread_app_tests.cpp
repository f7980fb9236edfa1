// Threads started by AfxBeginThread (user-interface threads with their own
// message maps, and worker functions) and the application's wait cursor.
#include "afxwin.h"

#include <gtest/gtest.h>

#include <atomic>

namespace {

const UINT WM_JOB = WM_APP + 20;
const UINT WM_USER_FAIL = WM_APP + 21;
UINT g_nRegisteredJob = ::RegisterWindowMessageA("QoMfcWndTests.Job");

std::atomic<int> g_nJobSum{0};
std::atomic<int> g_nDestroyed{0};
std::atomic<DWORD> g_dwHandlerThread{0};
HANDLE g_hJobDone = ::CreateEventA(NULL, FALSE, FALSE, NULL);

class CJobThread : public CWinThread {
  DECLARE_DYNCREATE(CJobThread)
public:
  CJobThread() {}
  virtual ~CJobThread() { g_nDestroyed++; }
  virtual BOOL InitInstance() { return TRUE; }
  virtual int ExitInstance() { return CWinThread::ExitInstance() + 100; }

protected:
  afx_msg void OnJob(WPARAM wParam, LPARAM lParam) {
    g_dwHandlerThread = ::GetCurrentThreadId();
    g_nJobSum += (int)(wParam * lParam);
    ::SetEvent(g_hJobDone);
  }
  afx_msg void OnUserFail(WPARAM, LPARAM) { AfxThrowUserException(); }
  DECLARE_MESSAGE_MAP()
};

IMPLEMENT_DYNCREATE(CJobThread, CWinThread)

BEGIN_MESSAGE_MAP(CJobThread, CWinThread)
  ON_THREAD_MESSAGE(WM_JOB, OnJob)
  ON_REGISTERED_THREAD_MESSAGE(g_nRegisteredJob, OnJob)
  ON_THREAD_MESSAGE(WM_USER_FAIL, OnUserFail)
END_MESSAGE_MAP()

HANDLE DuplicateThreadHandle(CWinThread* pThread) {
  HANDLE h = NULL;
  ::DuplicateHandle(::GetCurrentProcess(), pThread->m_hThread, ::GetCurrentProcess(), &h, 0, FALSE,
                    DUPLICATE_SAME_ACCESS);
  return h;
}

TEST(ThreadTest, UserInterfaceThreadHandlesThreadMessagesThroughItsMapAndDeletesItselfUnlessTold) {
  g_nJobSum = 0;
  int nDestroyedBefore = g_nDestroyed;
  CWinThread* pThread = AfxBeginThread(RUNTIME_CLASS(CJobThread), THREAD_PRIORITY_NORMAL, 0, CREATE_SUSPENDED);
  ASSERT_NE(nullptr, pThread);
  HANDLE hThread = DuplicateThreadHandle(pThread);
  DWORD nThreadID = pThread->m_nThreadID;

  // The queue exists already: messages posted before the start are kept.
  ASSERT_TRUE(pThread->PostThreadMessage(WM_JOB, 6, 7));
  EXPECT_EQ(WAIT_TIMEOUT, ::WaitForSingleObject(g_hJobDone, 150)) << "a suspended thread ran";
  EXPECT_EQ(0, g_nJobSum);
  pThread->ResumeThread();
  ASSERT_EQ(WAIT_OBJECT_0, ::WaitForSingleObject(g_hJobDone, 5000));
  EXPECT_EQ(42, g_nJobSum);
  EXPECT_EQ(nThreadID, g_dwHandlerThread);

  // An exception in a handler does not end the thread.
  ASSERT_TRUE(::PostThreadMessageA(nThreadID, WM_USER_FAIL, 0, 0));
  ASSERT_TRUE(::PostThreadMessageA(nThreadID, g_nRegisteredJob, 9, 1));
  ASSERT_EQ(WAIT_OBJECT_0, ::WaitForSingleObject(g_hJobDone, 5000));
  EXPECT_EQ(51, g_nJobSum);

  ASSERT_TRUE(::PostThreadMessageA(nThreadID, WM_QUIT, 5, 0));
  ASSERT_EQ(WAIT_OBJECT_0, ::WaitForSingleObject(hThread, 5000));
  DWORD dwExit = 0;
  ::GetExitCodeThread(hThread, &dwExit);
  EXPECT_EQ(105u, dwExit); // ExitInstance's result
  EXPECT_EQ(nDestroyedBefore + 1, g_nDestroyed.load());
  ::CloseHandle(hThread);

  // A thread object that is not auto-deleted survives its thread.
  nDestroyedBefore = g_nDestroyed;
  pThread = AfxBeginThread(RUNTIME_CLASS(CJobThread), THREAD_PRIORITY_NORMAL, 0, CREATE_SUSPENDED);
  ASSERT_NE(nullptr, pThread);
  pThread->m_bAutoDelete = FALSE;
  pThread->ResumeThread();
  pThread->PostThreadMessage(WM_QUIT, 1, 0);
  ASSERT_EQ(WAIT_OBJECT_0, ::WaitForSingleObject(pThread->m_hThread, 5000));
  EXPECT_EQ(nDestroyedBefore, g_nDestroyed.load());
  delete pThread;
  EXPECT_EQ(nDestroyedBefore + 1, g_nDestroyed.load());
}

struct WorkerParam {
  int nInput;
  int nOutput;
  CWinThread* pSelf;
};

UINT AFX_CDECL Worker(LPVOID pParam) {
  WorkerParam* p = (WorkerParam*)pParam;
  p->nOutput = p->nInput * 2;
  p->pSelf = AfxGetThread();
  return 42;
}

TEST(ThreadTest, WorkerFunctionRunsWithItsParameterAndReturnsTheExitCode) {
  WorkerParam param = {21, 0, NULL};
  CWinThread* pThread = AfxBeginThread(Worker, &param, THREAD_PRIORITY_NORMAL, 0, CREATE_SUSPENDED);
  ASSERT_NE(nullptr, pThread);
  HANDLE hThread = DuplicateThreadHandle(pThread);
  pThread->ResumeThread();
  ASSERT_EQ(WAIT_OBJECT_0, ::WaitForSingleObject(hThread, 5000));
  DWORD dwExit = 0;
  ::GetExitCodeThread(hThread, &dwExit);
  EXPECT_EQ(42u, dwExit);
  EXPECT_EQ(42, param.nOutput);
  EXPECT_EQ(pThread, param.pSelf); // the thread knew its own object
  ::CloseHandle(hThread);
}

TEST(ApplicationTest, WaitCursorIsCounted) {
  CWinApp* pApp = AfxGetApp();
  HCURSOR hWait = ::LoadCursorA(NULL, IDC_WAIT);
  pApp->BeginWaitCursor();
  pApp->BeginWaitCursor();
  EXPECT_EQ(hWait, ::GetCursor());
  pApp->EndWaitCursor();
  EXPECT_EQ(hWait, ::GetCursor()) << "one EndWaitCursor of two must keep the wait cursor";
  pApp->EndWaitCursor();
  EXPECT_NE(hWait, ::GetCursor());
  pApp->EndWaitCursor(); // unbalanced: stays at zero
  EXPECT_EQ(0, pApp->m_nWaitCursorCount);
}

} // namespace
